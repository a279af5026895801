#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace Store
{

/// What a subject may be called, and which names are the same.
namespace NameRule
{

/// 1 to 255 bytes, no control character, none of / \ : * ? " < > |, no space at either end.
inline constexpr std::string_view pattern = R"(^(?! )[^\x00-\x1F\x7F/\\:*?"<>|]{1,255}(?<! )$)";

inline constexpr std::size_t maximumBytes = 255;

/// True when the name matches the pattern in full, is UTF-8, is not "." or "..", and has no control character, line
/// separator, non-character or invisible character of Unicode anywhere, and none of its white space at either end.
/// [any]
[[nodiscard]] bool Allows(std::string_view name);

/// The same, and the name must match a second pattern in full as well, unless that is empty. Nothing matches a pattern
/// that is not well-formed, or that takes too long. [any]
[[nodiscard]] bool Allows(std::string_view name, const std::string& secondPattern);

[[nodiscard]] inline bool IsAscii(std::string_view name)
{
  for (const char c : name)
    if (static_cast<unsigned char>(c) >= 0x80)
      return false;
  return true;
}

/// The form by which names are compared: NFC. What is longer than any name, or not UTF-8, is its own. [any]
[[nodiscard]] std::string Canonical(std::string_view name);

}

}
