#pragma once

#include "HostInterface/NMX/IResult.h"

#include <exception>
#include <filesystem>
#include <string_view>
#include <type_traits>

namespace Files
{

/// The result for the failure to read a file that is being handled, a ConfigurationError: `FileIOFailure` when the file
/// itself cannot be read, `SerialisationFailure` when its content is wrong. Logs "The WHAT cannot be used: " and why.
NMX::IResult ReportUnusable(std::string_view what);

/// Reads a file of one sort, which messages call `what`: `content = read(file)`. `InvalidArgument` for an empty path,
/// `FileNotFound` when nothing is there, else as ReportUnusable. [any]
template <class Content>
NMX::IResult TryRead(std::string_view what, const std::filesystem::path& file,
                     Content (*read)(const std::filesystem::path&), Content& content)
{
  if (file.empty())
    return NMX::EResult::InvalidArgument;
  std::error_code error;
  if (std::filesystem::status(file, error).type() == std::filesystem::file_type::not_found)
    return NMX::EResult::FileNotFound;
  try
  {
    content = read(file);
    return NMX::EResult::Ok;
  }
  catch (const std::exception&)
  {
    return ReportUnusable(what);
  }
}

}
