#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace Store
{

/// What a subject may be called.
namespace NameRule
{

/// At least one character, no control character, none of / \ : * ? " < > |, no space at either end.
inline constexpr std::string_view pattern = R"(^(?! )[^\x00-\x1F\x7F/\\:*?"<>|]+(?<! )$)";

inline constexpr std::size_t maximumBytes = 255;

/// True when the name matches the pattern in full and is not longer than the maximum. [any]
[[nodiscard]] bool Allows(std::string_view name);

/// The same, and the name must match a second pattern in full as well, unless that is empty. Nothing matches a pattern
/// that is not well-formed, or that takes too long. [any]
[[nodiscard]] bool Allows(std::string_view name, const std::string& secondPattern);

}

}
