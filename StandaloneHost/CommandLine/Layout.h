#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace CommandLine
{

[[nodiscard]] bool IsUtf8(std::string_view text);

/// The text with all that steers a terminal or is not seen written out, as "\n", "\x1b" or "\u{202e}".
[[nodiscard]] std::string Visible(std::string_view text);

/// Visible, in quotes, and not endless.
[[nodiscard]] std::string Quoted(std::string_view text);

/// How many columns of a terminal a visible text takes.
[[nodiscard]] std::size_t Columns(std::string_view visible);

/// The visible text in lines of at most `width` columns, broken at spaces where there are any. Width 0: one line.
[[nodiscard]] std::vector<std::string> Wrap(std::string_view visible, std::size_t width);

/// Lines of visible cells, in columns two spaces apart. The last cell of a row goes on beneath itself when the row is
/// wider than `width`; 0: never. Each line begins with `indent` spaces and ends with a line break.
[[nodiscard]] std::string Table(const std::vector<std::vector<std::string>>& rows, std::size_t width,
                                std::size_t indent = 0);

/// Columns of the terminal that a descriptor leads to; 0 when it leads elsewhere.
[[nodiscard]] std::size_t TerminalWidth(int descriptor);

}
