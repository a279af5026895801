#include "RunaCorePluginSubjectStore/TerminalServer2/GroupTable.h"

#include "HostInterface/RunaCorePluginInterface/IPluginSettings.h"

namespace TerminalServer2
{

Level LevelFor(ELevel rule, std::uint32_t featureMask)
{
  namespace Feature = RunaCorePluginInterface::Feature;
  const auto openWith = [featureMask](std::uint32_t feature) -> Level { return (featureMask & feature) != 0 ? 2 : 1; };
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
  }
  return 1;
}

}
