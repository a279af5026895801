#include "StandaloneHost/Files/TextFile.h"

#include "StandaloneHost/Files/ConfigurationError.h"

#include <boost/locale/utf.hpp>

#include <cerrno>
#include <fstream>
#include <system_error>

namespace Files
{

namespace
{

/// Anything but a regular file could keep the host waiting for ever.
void CheckIsRegular(const std::filesystem::path& file)
{
  std::error_code error;
  const auto status = std::filesystem::status(file, error);
  if (error)
    FailUnreadable(file, "the file cannot be read: " + error.message(),
                   status.type() == std::filesystem::file_type::not_found ? NMX::EResult::FileNotFound
                                                                          : NMX::EResult::FileIOFailure);
  if (!std::filesystem::is_regular_file(status))
    FailUnreadable(file, std::filesystem::is_directory(status) ? "this is a directory, expected a file"
                                                               : "this is a device or a pipe, expected a file");
}

/// How many bytes the file has, when it is one that can be read at all.
std::size_t CheckedSize(const std::filesystem::path& file, std::size_t maximumBytes)
{
  CheckIsRegular(file);
  std::error_code error;
  const auto size = std::filesystem::file_size(file, error);
  if (error)
    FailUnreadable(file, "the file cannot be read: " + error.message());
  if (size > maximumBytes)
    Fail({&file}, "the file has " + std::to_string(size) + " bytes, expected at most " + std::to_string(maximumBytes));
  return static_cast<std::size_t>(size);
}

/// Far more than a tag needs. The XML reader compares the attributes of a tag with each other, which for hundreds of
/// thousands of them takes hours.
constexpr std::ptrdiff_t maximumTagBytes = 65536;

/// Refuses text that is not UTF-8, or that would keep the XML reader busy for ever.
void CheckText(const std::filesystem::path& file, std::string_view text)
{
  using Utf8 = boost::locale::utf::utf_traits<char>;
  const char* const end = text.data() + text.size();
  const char* tag = nullptr; // the one that is open; comments and the like are none
  Place tagPlace{&file};
  Place place{&file};
  for (const char* next = text.data(); next != end;)
  {
    const char* const here = next;
    const auto character = Utf8::decode(next, end);
    if (character == '<' && next != end && *next != '!')
    {
      tag = here;
      tagPlace = place;
    }
    else if (character == '>')
      tag = nullptr;
    if (tag != nullptr && here - tag > maximumTagBytes)
      Fail(tagPlace, "a tag of more than " + std::to_string(maximumTagBytes) + " bytes");
    if (character == boost::locale::utf::illegal || character == boost::locale::utf::incomplete)
      Fail(place, "this is not a UTF-8 character, expected a file in UTF-8");
    if (character == '\n')
      place = {&file, place.line + 1, 1};
    else
      ++place.column;
  }
}

}

std::string ReadTextFile(const std::filesystem::path& file, std::size_t maximumBytes)
{
  constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";
  std::string text(CheckedSize(file, maximumBytes), '\0');
  errno = 0;
  std::ifstream in(file, std::ios::binary);
  in.read(text.data(), static_cast<std::streamsize>(text.size()));
  if (!in.is_open() || in.bad())
    FailUnreadable(file, "the file cannot be read: " + std::generic_category().message(errno));
  text.resize(static_cast<std::size_t>(in.gcount()));

  if (text.starts_with(byteOrderMark))
    text.erase(0, byteOrderMark.size());
  if (text.empty())
    Fail({&file}, "the file is empty, expected XML");
  CheckText(file, text);
  return text;
}

void CheckReadable(const std::filesystem::path& file)
{
  CheckIsRegular(file);
  errno = 0;
  if (!std::ifstream(file, std::ios::binary))
    FailUnreadable(file, "the file cannot be read: " + std::generic_category().message(errno));
}

}
