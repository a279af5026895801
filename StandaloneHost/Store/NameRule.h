#pragma once

#include <cstddef>
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

}

}
