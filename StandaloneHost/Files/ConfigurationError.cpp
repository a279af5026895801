#include "StandaloneHost/Files/ConfigurationError.h"

#include <algorithm>

namespace Files
{

namespace
{

std::string Shortened(std::string_view text)
{
  constexpr std::size_t most = 60;
  if (text.size() <= most)
    return std::string(text);
  std::size_t end = most;
  while ((text[end] & 0xC0) == 0x80)
    --end;
  return std::string(text.substr(0, end)) + "...";
}

/// Names and texts of a file, and file names, may hold line ends.
std::string OnOneLine(std::string text)
{
  std::replace_if(text.begin(), text.end(), [](unsigned char c) { return c < 0x20 || c == 0x7F; }, ' ');
  return text;
}

std::string Message(const Place& place, std::string_view problem)
{
  return OnOneLine(PlaceText(place) + ": " + std::string(problem));
}

}

std::string PlaceText(const Place& place)
{
  return place.file->string() + ':' + std::to_string(place.line) + ':' + std::to_string(place.column);
}

void Fail(const Place& place, std::string_view problem, NMX::IResult result)
{
  throw ConfigurationError(Message(place, problem), result);
}

void FailUnreadable(const std::filesystem::path& file, std::string_view problem, NMX::IResult result)
{
  throw UnreadableFileError(Message({&file}, problem), result);
}

void FailUnwritable(const std::filesystem::path& file, std::string_view problem, NMX::IResult result)
{
  throw ConfigurationError(OnOneLine(file.string() + ": the file cannot be written: " + std::string(problem)), result);
}

std::string Quoted(std::string_view text)
{
  return '"' + Shortened(text) + '"';
}

std::string Tag(std::string_view name)
{
  return '<' + Shortened(name) + '>';
}

std::string Expected(std::span<const std::string_view> names)
{
  constexpr std::size_t most = 8;
  if (names.empty())
    return "expected none";
  std::string text = names.size() == 1 ? "expected " : "expected one of ";
  for (std::size_t index = 0; index < std::min(names.size(), most); ++index)
    text.append(index == 0 ? "" : ", ").append(names[index]);
  if (names.size() > most)
    text += ", ...";
  return text;
}

}
