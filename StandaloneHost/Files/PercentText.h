#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace Files
{

/// Whether an XML file can hold a text: all of its characters, which must be UTF-8.
[[nodiscard]] bool FitsXml(std::string_view text);

/// The text with "%", and each byte of a character that no XML file can hold, as "%" and two hexadecimal digits.
[[nodiscard]] std::string ToPercent(std::string_view text);

/// The text that ToPercent was given, or any other form of it; none when a "%" has not two digits after it.
[[nodiscard]] std::optional<std::string> FromPercent(std::string_view text);

}
