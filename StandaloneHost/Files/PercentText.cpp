#include "StandaloneHost/Files/PercentText.h"

#include <algorithm>
#include <charconv>
#include <system_error>

namespace Files
{

namespace
{

/// How many bytes at the front of the text are a character that XML does not know: a control character, or one of the
/// two at the end of the first plane.
std::size_t Unfit(std::string_view text)
{
  const auto first = static_cast<unsigned char>(text.front());
  if (first < 0x20)
    return first == '\t' || first == '\n' || first == '\r' ? 0 : 1;
  return text.starts_with("\uFFFE") || text.starts_with("\uFFFF") ? 3 : 0;
}

void AppendByte(std::string& text, char byte)
{
  constexpr std::string_view digits = "0123456789ABCDEF";
  const auto value = static_cast<unsigned char>(byte);
  text += '%';
  text += digits[value / 16];
  text += digits[value % 16];
}

}

bool FitsXml(std::string_view text)
{
  for (; !text.empty(); text.remove_prefix(1))
    if (Unfit(text) != 0)
      return false;
  return true;
}

std::string ToPercent(std::string_view text)
{
  std::string encoded;
  while (!text.empty())
  {
    const std::size_t bytes = text.front() == '%' ? 1 : Unfit(text);
    std::ranges::for_each(text.substr(0, bytes), [&](char byte) { AppendByte(encoded, byte); });
    if (bytes == 0)
      encoded += text.front();
    text.remove_prefix(std::max<std::size_t>(bytes, 1));
  }
  return encoded;
}

std::optional<std::string> FromPercent(std::string_view text)
{
  std::string decoded;
  while (!text.empty())
  {
    if (text.front() != '%')
    {
      decoded += text.front();
      text.remove_prefix(1);
      continue;
    }
    const std::string_view digits = text.substr(1, 2);
    unsigned char byte = 0;
    const auto read = std::from_chars(digits.data(), digits.data() + digits.size(), byte, 16);
    if (digits.size() != 2 || read.ec != std::errc{} || read.ptr != digits.data() + digits.size())
      return std::nullopt;
    decoded += static_cast<char>(byte);
    text.remove_prefix(3);
  }
  return decoded;
}

}
