#pragma once

#include <string_view>

namespace SubjectStoreUI
{

/// Compares two texts as people sort names: negative when `a` comes first, positive when `b` does, 0 when they differ
/// in the case of ASCII letters and in leading zeros at most. Runs of digits, however long, compare as numbers; a digit
/// comes before any other character. What is not ASCII compares byte by byte.
[[nodiscard]] int CompareNaturally(std::string_view a, std::string_view b);

/// The total order by CompareNaturally; what is equal there is ordered byte by byte.
[[nodiscard]] bool NaturallyLess(std::string_view a, std::string_view b);

}
