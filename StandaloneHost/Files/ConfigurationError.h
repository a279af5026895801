#pragma once

#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <filesystem>
#include <span>
#include <stdexcept>
#include <string>
#include <string_view>

namespace Files
{

/// Why a file of subjects could not be read or written, as one line for people, and as a result. What is wrong with a
/// file that is read begins with its place: "FILE:LINE:COLUMN: what is wrong, what was expected".
class ConfigurationError : public std::runtime_error
{
public:
  explicit ConfigurationError(const std::string& text, NMX::IResult result = NMX::EResult::SerialisationFailure)
      : std::runtime_error(text), m_result(result)
  {
  }

  /// `SerialisationFailure` unless something else than the file's content is the reason.
  [[nodiscard]] NMX::IResult Result() const { return m_result; }

private:
  NMX::IResult m_result;
};

/// The same, when nothing is wrong with what the file says but the file itself cannot be read: it is missing, no
/// regular file, not permitted, or reading it fails.
class UnreadableFileError : public ConfigurationError
{
public:
  UnreadableFileError(const std::string& text, NMX::IResult result) : ConfigurationError(text, result) {}
};

/// Where something stands in a file. Lines and columns count from 1, columns in characters.
struct Place
{
  const std::filesystem::path* file; ///< outlives the place
  std::uint32_t line = 1;
  std::uint32_t column = 1;
};

/// "FILE:LINE:COLUMN".
[[nodiscard]] std::string PlaceText(const Place& place);

/// Throws the ConfigurationError that tells of a problem at a place.
[[noreturn]] void Fail(const Place& place, std::string_view problem,
                       NMX::IResult result = NMX::EResult::SerialisationFailure);

/// Throws the UnreadableFileError that tells why a file cannot be read.
[[noreturn]] void FailUnreadable(const std::filesystem::path& file, std::string_view problem,
                                 NMX::IResult result = NMX::EResult::FileIOFailure);

/// Throws the ConfigurationError that tells why a file cannot be written.
[[noreturn]] void FailUnwritable(const std::filesystem::path& file, std::string_view problem, NMX::IResult result);

/// Text of a file as messages quote it; what is too long is cut.
[[nodiscard]] std::string Quoted(std::string_view text);

/// The tag of an element as messages name it.
[[nodiscard]] std::string Tag(std::string_view name);

/// "expected A", "expected one of A, B" or "expected none"; a long list is cut.
[[nodiscard]] std::string Expected(std::span<const std::string_view> names);

}
