#include "StandaloneHost/Store/NameRule.h"

#include <boost/regex.hpp>
#include <utf8proc.h>

#include <cstdlib>
#include <memory>
#include <optional>

namespace Store::NameRule
{

namespace
{

/// The expression of a pattern; none when it is not well-formed. The latest is kept, as it hardly ever changes.
const std::optional<boost::regex>& Compiled(const std::string& text)
{
  thread_local std::string latest;
  thread_local std::optional<boost::regex> expression;
  if (latest == text && !latest.empty())
    return expression;
  expression.reset();
  latest = text;
  try
  {
    expression.emplace(text, boost::regex::perl);
  }
  catch (const boost::regex_error&)
  {
    expression.reset();
  }
  return expression;
}

bool IsWhiteSpace(utf8proc_category_t category)
{
  return category == UTF8PROC_CATEGORY_ZS || category == UTF8PROC_CATEGORY_ZL || category == UTF8PROC_CATEGORY_ZP;
}

/// Whether a character may be somewhere in a name. What cannot be seen would make names that look alike, or turn the
/// rest of a line round.
bool IsVisible(utf8proc_int32_t character)
{
  const utf8proc_property_t& property = *utf8proc_get_property(character);
  const bool nonCharacter = (character & 0xFFFE) == 0xFFFE || (character >= 0xFDD0 && character <= 0xFDEF);
  return property.category != UTF8PROC_CATEGORY_CC && property.category != UTF8PROC_CATEGORY_ZL &&
         property.category != UTF8PROC_CATEGORY_ZP && property.ignorable == 0 && !nonCharacter;
}

/// The rules beyond ASCII, for text that is not ASCII alone.
bool IsVisibleText(std::string_view name)
{
  const auto* next = reinterpret_cast<const utf8proc_uint8_t*>(name.data());
  auto left = static_cast<utf8proc_ssize_t>(name.size());
  for (bool first = true; left > 0; first = false)
  {
    utf8proc_int32_t character = 0;
    const utf8proc_ssize_t size = utf8proc_iterate(next, left, &character);
    if (size <= 0 || !IsVisible(character))
      return false;
    next += size;
    left -= size;
    if ((first || left == 0) && IsWhiteSpace(utf8proc_category(character)))
      return false;
  }
  return true;
}

/// Three times the longest name: its decomposed form has at most so many bytes.
constexpr std::size_t maximumCompared = 3 * maximumBytes;

}

bool Allows(std::string_view name)
{
  if (name.size() > maximumBytes || name == "." || name == "..")
    return false;
  static const boost::regex expression(pattern.begin(), pattern.end(), boost::regex::perl);
  return boost::regex_match(name.begin(), name.end(), expression) && (IsAscii(name) || IsVisibleText(name));
}

bool Allows(std::string_view name, const std::string& secondPattern)
{
  if (!Allows(name))
    return false;
  if (secondPattern.empty() || secondPattern == pattern)
    return true;
  const auto& expression = Compiled(secondPattern);
  try
  {
    return expression && boost::regex_match(name.begin(), name.end(), *expression);
  }
  catch (const std::runtime_error&) // too complex for the name
  {
    return false;
  }
}

std::string Canonical(std::string_view name)
{
  if (IsAscii(name) || name.size() > maximumCompared)
    return std::string(name);
  utf8proc_uint8_t* composed = nullptr;
  const utf8proc_ssize_t size =
      utf8proc_map(reinterpret_cast<const utf8proc_uint8_t*>(name.data()), static_cast<utf8proc_ssize_t>(name.size()),
                   &composed, static_cast<utf8proc_option_t>(UTF8PROC_STABLE | UTF8PROC_COMPOSE));
  const std::unique_ptr<utf8proc_uint8_t, decltype(&std::free)> owner(composed, &std::free);
  return size < 0 ? std::string(name)
                  : std::string(reinterpret_cast<const char*>(composed), static_cast<std::size_t>(size));
}

}
