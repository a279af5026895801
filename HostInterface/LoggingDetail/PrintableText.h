#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace LoggingDetail
{

/// A text made fit for a line on a terminal or in a window, whoever wrote it: what would steer the terminal, end the
/// line, turn the direction of reading or not be seen is written out ("\n", "\x1b", "\u{202e}"), and so is what is not
/// UTF-8 ("\xff"). At most `longest` bytes are shown, in whole characters; a mark says how long a text is of which
/// something was left out, and comes on top.
[[nodiscard]] std::string PrintableText(std::string_view text, std::size_t longest = std::string_view::npos);

/// Takes the next character off a text that is not empty; `notUtf8` for a byte that begins none.
[[nodiscard]] std::uint32_t TakeCharacter(std::string_view& text);
inline constexpr std::uint32_t notUtf8 = 0xFFFFFFFF;

/// Columns of a terminal that a character takes; negative when it cannot be shown.
[[nodiscard]] int ColumnsOf(std::uint32_t character);

}
