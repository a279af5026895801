#include "HostInterface/LoggingDetail/PrintableText.h"

#include <boost/locale/utf.hpp>

#include <algorithm>
#include <array>
#include <cstdint>

namespace LoggingDetail
{

namespace
{

using Utf8 = boost::locale::utf::utf_traits<char>;
using boost::locale::utf::code_point;

bool IsPlain(char c)
{
  return c >= ' ' && c <= '~' && c != '\\';
}

struct Range
{
  code_point first, last;
};

/// Characters that nobody sees and that change what is seen, and those that end a line outside of ASCII.
constexpr std::array unprintable{
    Range{0x00, 0x1F},     Range{'\\', '\\'},     Range{0x7F, 0x9F},     Range{0x61C, 0x61C},
    Range{0x200E, 0x200F}, Range{0x2028, 0x202E}, Range{0x2066, 0x2069},
};

std::string Hexadecimal(const char* begin, std::uint32_t number, int digits)
{
  std::string text = begin;
  for (int shift = 4 * (digits - 1); shift >= 0; shift -= 4)
    text += "0123456789abcdef"[(number >> shift) & 0xF];
  return text;
}

std::string Escaped(code_point character)
{
  switch (character)
  {
  case '\n':
    return "\\n";
  case '\r':
    return "\\r";
  case '\t':
    return "\\t";
  case '\\':
    return "\\\\";
  default:
    return character < 0x80 ? Hexadecimal("\\x", character, 2) : Hexadecimal("\\u", character, 4);
  }
}

/// The next character as it is shown; moves on `text`.
std::string NextCharacter(std::string_view& text)
{
  const char* end = text.data();
  const code_point character = Utf8::decode(end, text.data() + text.size());
  if (character == boost::locale::utf::illegal || character == boost::locale::utf::incomplete)
  {
    const auto byte = static_cast<unsigned char>(text.front());
    text.remove_prefix(1);
    return Hexadecimal("\\x", byte, 2);
  }
  const std::string_view bytes = text.substr(0, static_cast<std::size_t>(end - text.data()));
  text.remove_prefix(bytes.size());
  const auto holds = [&](const Range& range) { return character >= range.first && character <= range.last; };
  return std::any_of(unprintable.begin(), unprintable.end(), holds) ? Escaped(character) : std::string(bytes);
}

}

std::string PrintableText(std::string_view text, std::size_t longest)
{
  std::string shown;
  std::string_view rest = text;
  while (!rest.empty())
  {
    const auto room = static_cast<std::ptrdiff_t>(std::min(longest - shown.size(), rest.size()));
    const auto plain = std::find_if_not(rest.begin(), rest.begin() + room, &IsPlain);
    shown.append(rest.begin(), plain);
    rest.remove_prefix(static_cast<std::size_t>(plain - rest.begin()));
    if (rest.empty())
      break;
    const std::string next = NextCharacter(rest);
    if (next.size() > longest - shown.size())
      return shown + "… (" + std::to_string(text.size()) + " bytes in all)";
    shown += next;
  }
  return shown;
}

}
