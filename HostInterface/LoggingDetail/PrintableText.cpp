#include "HostInterface/LoggingDetail/PrintableText.h"

#include <boost/locale/utf.hpp>

#include <algorithm>
#include <array>
#include <clocale>
#include <cstdio>
#include <cwchar>

namespace LoggingDetail
{

namespace
{

bool IsPlain(char c)
{
  return c >= ' ' && c <= '~';
}

/// Characters without a shape that turn, join or part what stands around them.
bool IsInvisible(std::uint32_t character)
{
  return (character >= 0x200B && character <= 0x200F) || (character >= 0x2028 && character <= 0x202E) ||
         (character >= 0x2060 && character <= 0x206F) || character == 0xFEFF || character == 0xAD ||
         character == 0x61C || (character >= 0xE0000 && character <= 0xE0FFF);
}

std::string Escape(std::uint32_t character, char byte)
{
  switch (character)
  {
  case '\n':
    return "\\n";
  case '\r':
    return "\\r";
  case '\t':
    return "\\t";
  default:
    break;
  }
  std::array<char, 16> text{};
  if (character == notUtf8 || character < 0x80)
    std::snprintf(text.data(), text.size(), "\\x%02x", static_cast<unsigned>(static_cast<unsigned char>(byte)));
  else
    std::snprintf(text.data(), text.size(), "\\u{%x}", static_cast<unsigned>(character));
  return text.data();
}

/// The next character as it is shown; taken off the text.
std::string NextCharacter(std::string_view& text)
{
  const std::string_view before = text;
  const std::uint32_t character = TakeCharacter(text);
  if (character == notUtf8 || IsInvisible(character) || ColumnsOf(character) < 0 || character < 0x20)
    return Escape(character, before.front());
  return std::string(before.substr(0, before.size() - text.size()));
}

}

std::uint32_t TakeCharacter(std::string_view& text)
{
  namespace utf = boost::locale::utf;
  const char* position = text.data();
  const utf::code_point character = utf::utf_traits<char>::decode(position, text.data() + text.size());
  const bool good = utf::is_valid_codepoint(character);
  text.remove_prefix(good ? static_cast<std::size_t>(position - text.data()) : 1);
  return good ? character : notUtf8;
}

/// Whatever locale the user has: the program's texts are UTF-8.
int ColumnsOf(std::uint32_t character)
{
  static const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
  if (locale == nullptr || character == notUtf8)
    return character >= 0x20 && character < 0x7F ? 1 : -1;
  const locale_t before = uselocale(locale);
  const int width = wcwidth(static_cast<wchar_t>(character));
  uselocale(before);
  return width;
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
