#include "StandaloneHost/CommandLine/Layout.h"

#include <boost/locale/utf.hpp>

#include <algorithm>
#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cwchar>
#include <sys/ioctl.h>
#include <unistd.h>

namespace CommandLine
{

namespace
{

namespace utf = boost::locale::utf;
using Utf8 = utf::utf_traits<char>;

constexpr std::size_t leastWidth = 20; // of a wrapped cell, however narrow the terminal
constexpr std::size_t longestQuote = 200;

/// Takes the next character off the text; `utf::illegal` or `utf::incomplete` for a byte that begins none.
utf::code_point TakeCharacter(std::string_view& text)
{
  const char* position = text.data();
  const utf::code_point character = Utf8::decode(position, text.data() + text.size());
  const bool good = utf::is_valid_codepoint(character);
  text.remove_prefix(good ? static_cast<std::size_t>(position - text.data()) : 1);
  return character;
}

/// Columns that a character takes; negative when it cannot be shown. Whatever locale the user has: the host's texts are
/// UTF-8.
int Width(utf::code_point character)
{
  static const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
  if (locale == nullptr)
    return character >= 0x20 && character < 0x7F ? 1 : -1;
  const locale_t before = uselocale(locale);
  const int width = wcwidth(static_cast<wchar_t>(character));
  uselocale(before);
  return width;
}

/// Characters without a shape that turn or join what stands around them.
bool IsInvisible(utf::code_point character)
{
  return (character >= 0x200B && character <= 0x200F) || (character >= 0x2028 && character <= 0x202E) ||
         (character >= 0x2060 && character <= 0x206F) || character == 0xFEFF || character == 0xAD ||
         (character >= 0xE0000 && character <= 0xE0FFF);
}

std::string Escape(utf::code_point character, char byte)
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
  char text[16];
  if (!utf::is_valid_codepoint(character) || character < 0x80)
    std::snprintf(text, sizeof text, "\\x%02x", static_cast<unsigned>(static_cast<unsigned char>(byte)));
  else
    std::snprintf(text, sizeof text, "\\u{%x}", static_cast<unsigned>(character));
  return text;
}

/// The longest beginning of the text that takes at most `width` columns, but at least one character.
std::size_t Fitting(std::string_view text, std::size_t width)
{
  std::string_view rest = text;
  std::size_t columns = 0;
  while (!rest.empty())
  {
    std::string_view next = rest;
    columns += static_cast<std::size_t>(std::max(0, Width(TakeCharacter(next))));
    if (columns > width && rest.size() != text.size())
      break;
    rest = next;
  }
  return text.size() - rest.size();
}

}

bool IsUtf8(std::string_view text)
{
  while (!text.empty())
    if (!utf::is_valid_codepoint(TakeCharacter(text)))
      return false;
  return true;
}

std::string Visible(std::string_view text)
{
  std::string visible;
  while (!text.empty())
  {
    const std::string_view before = text;
    const utf::code_point character = TakeCharacter(text);
    if (!utf::is_valid_codepoint(character) || character < 0x20 || IsInvisible(character) || Width(character) < 0)
      visible += Escape(character, before.front());
    else
      visible += before.substr(0, before.size() - text.size());
  }
  return visible;
}

std::string Quoted(std::string_view text)
{
  std::string visible = Visible(text.substr(0, 4 * longestQuote));
  if (Columns(visible) > longestQuote)
    visible = visible.substr(0, Fitting(visible, longestQuote)) + "…";
  return '"' + visible + '"';
}

std::size_t Columns(std::string_view visible)
{
  std::size_t columns = 0;
  while (!visible.empty())
    columns += static_cast<std::size_t>(std::max(0, Width(TakeCharacter(visible))));
  return columns;
}

std::vector<std::string> Wrap(std::string_view visible, std::size_t width)
{
  std::vector<std::string> lines;
  while (width != 0 && Columns(visible) > width)
  {
    const std::size_t fitting = Fitting(visible, width);
    // A space right behind the line is a place to break it, too.
    const std::size_t space = visible.rfind(' ', fitting);
    const std::size_t end = space == std::string_view::npos || space == 0 ? fitting : space;
    lines.emplace_back(visible.substr(0, end));
    visible.remove_prefix(end);
    visible.remove_prefix(std::min(visible.find_first_not_of(' '), visible.size()));
  }
  if (lines.empty() || !visible.empty())
    lines.emplace_back(visible);
  return lines;
}

std::string Table(const std::vector<std::vector<std::string>>& rows, std::size_t width, std::size_t indent)
{
  std::vector<std::size_t> widths;
  for (const auto& row : rows)
    for (std::size_t i = 0; i + 1 < row.size(); ++i)
    {
      widths.resize(std::max(widths.size(), i + 1));
      widths[i] = std::max(widths[i], Columns(row[i]));
    }
  std::string text;
  for (const auto& row : rows)
  {
    std::string line(indent, ' ');
    std::size_t start = indent;
    for (std::size_t i = 0; i + 1 < row.size(); ++i)
    {
      start += widths[i] + 2;
      line += row[i] + std::string(widths[i] + 2 - Columns(row[i]), ' ');
    }
    const std::size_t room = width == 0 ? 0 : std::max(width - std::min(width, start), leastWidth);
    const std::vector<std::string> last = Wrap(row.empty() ? std::string_view{} : row.back(), room);
    for (std::size_t i = 0; i < last.size(); ++i)
    {
      line = (i == 0 ? line : std::string(start, ' ')) + last[i];
      line.erase(line.find_last_not_of(' ') + 1);
      text += line + '\n';
    }
  }
  return text;
}

std::size_t TerminalWidth(int descriptor)
{
  if (isatty(descriptor) == 0)
    return 0;
  constexpr std::size_t usual = 80;
  winsize size{};
  if (ioctl(descriptor, TIOCGWINSZ, &size) != 0 || size.ws_col == 0)
    return usual;
  return size.ws_col;
}

}
