#include "HostInterface/NMX/IntegerText.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <string>

namespace NMX
{

namespace
{

constexpr std::string_view whiteSpace = " \t\r\n";

/// No text has so many digits that a number with such an exponent could be an integer in range.
constexpr std::int64_t farExponent = std::int64_t{1} << 40;

/// The exponent's number; one that is too large for any integer is as good as the largest.
std::int64_t ExponentFrom(std::string_view text)
{
  if (text.starts_with('+'))
    text.remove_prefix(1);
  std::int64_t exponent = 0;
  const auto read = std::from_chars(text.data(), text.data() + text.size(), exponent);
  if (read.ec == std::errc::result_out_of_range)
    return text.starts_with('-') ? -farExponent : farExponent;
  return std::clamp(exponent, -farExponent, farExponent);
}

/// The digits as a number, followed by so many zeros.
std::optional<std::uint64_t> Composed(std::string_view digits, std::int64_t zeros)
{
  constexpr std::int64_t mostDigits = std::numeric_limits<std::uint64_t>::digits10 + 1;
  if (static_cast<std::int64_t>(digits.size()) + zeros > mostDigits)
    return std::nullopt;
  std::string text(digits);
  text.append(static_cast<std::size_t>(zeros), '0');
  std::uint64_t number = 0;
  const auto read = std::from_chars(text.data(), text.data() + text.size(), number);
  return read.ec == std::errc{} ? std::optional(number) : std::nullopt;
}

}

std::optional<std::uint64_t> IntegerFromJsonNumber(std::string_view text)
{
  text.remove_prefix(std::min(text.find_first_not_of(whiteSpace), text.size()));
  text = text.substr(0, text.find_last_not_of(whiteSpace) + 1);
  const bool negative = text.starts_with('-');
  const std::size_t mark = std::min(text.find_first_of("eE"), text.size());
  const std::string_view mantissa = text.substr(negative ? 1 : 0, mark - (negative ? 1 : 0));
  const std::size_t point = std::min(mantissa.find('.'), mantissa.size());
  const std::string_view fraction = mantissa.substr(std::min(point + 1, mantissa.size()));
  std::string digits = std::string(mantissa.substr(0, point)) + std::string(fraction);
  digits.erase(0, std::min(digits.find_first_not_of('0'), digits.size()));
  if (digits.empty())
    return 0;
  if (negative)
    return std::nullopt;
  const std::size_t kept = digits.find_last_not_of('0') + 1;
  const std::int64_t exponent = (mark < text.size() ? ExponentFrom(text.substr(mark + 1)) : 0) -
                                static_cast<std::int64_t>(fraction.size()) +
                                static_cast<std::int64_t>(digits.size() - kept);
  return exponent >= 0 ? Composed(std::string_view(digits).substr(0, kept), exponent) : std::nullopt;
}

}
