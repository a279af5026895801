#include "RunaCorePluginSubjectStore/TerminalServer2/GroupTable.h"

#include "HostInterface/RunaCorePluginInterface/IPluginSettings.h"

namespace TerminalServer2
{

Level LevelFor(ELevel rule, const Grants& grants)
{
  namespace Feature = RunaCorePluginInterface::Feature;
  const auto openWith = [&grants](std::uint32_t feature) -> Level
  { return (grants.featureMask & feature) != 0 ? 2 : 1; };
  switch (rule)
  {
  case ELevel::Open:
    return 2;
  case ELevel::AutoAssign:
    return openWith(Feature::objectAutoAssign);
  case ELevel::Grouping:
    return openWith(Feature::proximityGrouping);
  case ELevel::ObjectEvaluation:
    return openWith(Feature::objectEvaluation);
  case ELevel::SubjectCalibration:
    return grants.subjectCalibration ? 2 : 1;
  }
  return 1;
}

}
