#include "StandaloneHost/Store/NameRule.h"

#include <boost/regex.hpp>

namespace Store::NameRule
{

bool Allows(std::string_view name)
{
  static const boost::regex expression(pattern.begin(), pattern.end(), boost::regex::perl);
  return name.size() <= maximumBytes && boost::regex_match(name.begin(), name.end(), expression);
}

}
