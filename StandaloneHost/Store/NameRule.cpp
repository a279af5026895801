#include "StandaloneHost/Store/NameRule.h"

#include <boost/regex.hpp>

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

}

bool Allows(std::string_view name)
{
  static const boost::regex expression(pattern.begin(), pattern.end(), boost::regex::perl);
  // The length is asked first: what is far too long is not looked at.
  return name.size() <= maximumBytes && boost::regex_match(name.begin(), name.end(), expression);
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

}
