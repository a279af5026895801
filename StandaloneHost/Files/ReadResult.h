#pragma once

#include "HostInterface/NMX/FileWork.h"
#include "HostInterface/NMX/IResult.h"
#include "StandaloneHost/Files/ConfigurationError.h"

#include <filesystem>
#include <memory>
#include <string>
#include <string_view>
#include <system_error>

namespace Files
{

/// What came of reading a file.
template <class Content>
struct ReadOutcome
{
  NMX::IResult result = NMX::EResult::Ok;
  std::string problem{}; ///< what the log says of a file that cannot be used
  Content content{};
};

/// Reads a file with `read`, which may throw a ConfigurationError. `FileNotFound` when nothing is there,
/// `FileIOFailure` when the file itself cannot be read, `SerialisationFailure` when its content is wrong. Logs nothing.
/// [any]
template <auto read>
auto TryRead(const std::filesystem::path& file) -> ReadOutcome<decltype(read(file))>
{
  std::error_code error;
  if (std::filesystem::status(file, error).type() == std::filesystem::file_type::not_found)
    return {NMX::EResult::FileNotFound};
  try
  {
    return {NMX::EResult::Ok, {}, read(file)};
  }
  catch (const ConfigurationError& failure)
  {
    return {failure.Result(), failure.what()};
  }
}

/// Logs "The WHAT cannot be used: " and why, when there is something to say.
void ReportUnusable(std::string_view what, std::string_view problem);

/// Reads a file of one sort, which messages call `what`, through NMX::LookAtFile. Results as of TryRead, and
/// `InvalidArgument` for an empty path, `FileIOFailure` for a file that does not answer. [any]
template <auto read, class Content>
NMX::IResult Read(std::string_view what, const std::filesystem::path& file, std::shared_ptr<const Content>& content)
{
  if (file.empty())
    return NMX::EResult::InvalidArgument;
  const auto outcome = NMX::LookAtFile(file, &TryRead<read>);
  if (!outcome)
    return NMX::EResult::FileIOFailure;
  ReportUnusable(what, outcome->problem);
  content = std::shared_ptr<const Content>(outcome, &outcome->content);
  return outcome->result;
}

}
