#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace LoggingDetail
{

/// A text made fit for one line of a log, whoever wrote it: what would control a terminal, end the line or change the
/// direction of reading is escaped ("\n", "\x1b", "\u202e"), and so are what is not UTF-8 ("\xff") and the backslash
/// ("\\"). At most `longest` bytes are shown, whole characters and escapes; a mark says how long a text is of which
/// something was left out, and comes on top.
[[nodiscard]] std::string PrintableText(std::string_view text, std::size_t longest);

}
