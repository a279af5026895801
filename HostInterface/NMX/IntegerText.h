#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace NMX
{

/// The integer that a JSON number is, however it is written (7, 7.0 and 70e-1 are the same number): worked out from the
/// digits, as a double is not exact above 2^53. None when it is negative, has a fraction, or is above 2^64 - 1; the
/// text must be a JSON number. [any]
[[nodiscard]] std::optional<std::uint64_t> IntegerFromJsonNumber(std::string_view text);

}
