#include "StandaloneHost/CommandLine/Layout.h"

#include "HostInterface/LoggingDetail/PrintableText.h"

#include <algorithm>
#include <sys/ioctl.h>
#include <unistd.h>

namespace CommandLine
{

namespace
{

using LoggingDetail::ColumnsOf;
using LoggingDetail::TakeCharacter;

constexpr std::size_t leastWidth = 20; // of a wrapped cell, however narrow the terminal
constexpr std::size_t longestQuote = 200;

/// The longest beginning of the text that takes at most `width` columns, but at least one character.
std::size_t Fitting(std::string_view text, std::size_t width)
{
  std::string_view rest = text;
  std::size_t columns = 0;
  while (!rest.empty())
  {
    std::string_view next = rest;
    columns += static_cast<std::size_t>(std::max(0, ColumnsOf(TakeCharacter(next))));
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
    if (TakeCharacter(text) == LoggingDetail::notUtf8)
      return false;
  return true;
}

std::string Visible(std::string_view text)
{
  return LoggingDetail::PrintableText(text);
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
    columns += static_cast<std::size_t>(std::max(0, ColumnsOf(TakeCharacter(visible))));
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
