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

/// How many bytes the file has, when it is one that can be read at all.
std::size_t CheckedSize(const std::filesystem::path& file)
{
  std::error_code error;
  const auto status = std::filesystem::status(file, error);
  if (error)
    Fail({&file}, "the file cannot be read: " + error.message());
  // Anything else could keep the host waiting for ever.
  if (!std::filesystem::is_regular_file(status))
    Fail({&file}, std::filesystem::is_directory(status) ? "this is a directory, expected a file"
                                                        : "this is a device or a pipe, expected a file");
  const auto size = std::filesystem::file_size(file, error);
  if (error)
    Fail({&file}, "the file cannot be read: " + error.message());
  if (size > maximumFileBytes)
    Fail({&file},
         "the file has " + std::to_string(size) + " bytes, expected at most " + std::to_string(maximumFileBytes));
  return static_cast<std::size_t>(size);
}

void CheckUtf8(const std::filesystem::path& file, std::string_view text)
{
  using Utf8 = boost::locale::utf::utf_traits<char>;
  Place place{&file};
  for (const char* next = text.data(); next != text.data() + text.size();)
  {
    const auto character = Utf8::decode(next, text.data() + text.size());
    if (character == boost::locale::utf::illegal || character == boost::locale::utf::incomplete)
      Fail(place, "this is not a UTF-8 character, expected a file in UTF-8");
    if (character == '\n')
      place = {&file, place.line + 1, 1};
    else
      ++place.column;
  }
}

}

std::string ReadTextFile(const std::filesystem::path& file)
{
  constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";
  std::string text(CheckedSize(file), '\0');
  errno = 0;
  std::ifstream in(file, std::ios::binary);
  in.read(text.data(), static_cast<std::streamsize>(text.size()));
  if (!in.is_open() || in.bad())
    Fail({&file}, "the file cannot be read: " + std::generic_category().message(errno));
  text.resize(static_cast<std::size_t>(in.gcount()));

  if (text.starts_with(byteOrderMark))
    text.erase(0, byteOrderMark.size());
  if (text.empty())
    Fail({&file}, "the file is empty, expected XML");
  CheckUtf8(file, text);
  return text;
}

}
