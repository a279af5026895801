#include "RunaCorePluginSubjectStore/Subjects/NameCheck.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <boost/regex.hpp>

#include <stdexcept>

namespace Subjects
{

NMX::IResult CheckNewName(std::string_view name)
{
  if (!name.empty() && (name.front() == ' ' || name.back() == ' '))
    return NMX::EResult::InvalidName;
  return NMX::EResult::Ok;
}

bool MatchesPattern(std::string_view name, const std::string& pattern)
{
  try
  {
    return boost::regex_match(name.begin(), name.end(), boost::regex(pattern, boost::regex::perl));
  }
  catch (const std::runtime_error& failure)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "The name pattern \"%1%\" cannot be applied: %2%", pattern,
             failure.what());
    return false;
  }
}

}
