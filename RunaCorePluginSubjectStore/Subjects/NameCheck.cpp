#include "RunaCorePluginSubjectStore/Subjects/NameCheck.h"

namespace Subjects
{

NMX::IResult CheckNewName(std::string_view name)
{
  if (!name.empty() && (name.front() == ' ' || name.back() == ' '))
    return NMX::EResult::InvalidName;
  return NMX::EResult::Ok;
}

}
