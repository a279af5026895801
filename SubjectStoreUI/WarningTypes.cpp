#include "SubjectStoreUI/WarningTypes.h"

#include <algorithm>
#include <cstddef>
#include <iterator>

namespace SubjectStoreUI
{

namespace
{

// The index is the type id.
constexpr WarningType types[] = {
    {"Warnings", ""},

    {"WarningDuplicateDevice", "%1 smart object%2 duplicate device links."},
    {"WarningDuplicatePattern", "%1 smart object%2 duplicate patterns."},
    {"WarningNoPattern", "%1 smart object%2 not been assigned a pattern."},
    {"WarningEmptySlot", "%1 character%2 unassigned slots."},
    {"WarningCFCChildWarning", "%1 character%2 warnings on assigned clusters."},
    {"WarningDisconnectedDevice", "%1 smart object%2 a disconnected linked device."},
    {"WarningMissingDevice", "%1 smart object%2 a missing linked device."},
    {"WarningDeviceNotLinked", "%1 smart object%2 empty device links."},
    {"WarningDuplicateCluster", "%1 labeling cluster%2 identical guids."},
    {"WarningNotCalibrated", "%1 subject%2 not been calibrated."},
    {"WarningProximityGroupMissingUnique", "%1 object%2 a proximity group containing no unique objects."},
    {"WarningProximityGroupDuplicateTemplates", "%1 object%2 duplicate templates in their proximity group."},
    {"WarningTemplateGroupNoProximityGroup", "%1 object%2 a template group name but no proximity group name."},
    {"WarningTemplateGroupNonIdentical", "%1 object%2 a template group containing non-identical objects."},
    {"WarningTemplateGroupProcessingNotEnabled",
     "%1 object%2 a template group name but Proximity Grouping and Object Instance Tracking are both disabled in "
     "Processing."},
    {"WarningCFCNoReferenceClusterAssigned",
     "%1 character%2 no reference cluster assigned (one with auto-assign disabled)."},
    {"WarningInsufficientAutoAssignCandidates",
     "%1 character%2 more empty slots than there are auto-assignable objects to fill them."},
    {"WarningObjectConfusion",
     "%1 object%2 a marker pattern that could be confused with another object, or another view of itself."},
    {"WarningObjectConfusionCritical",
     "%1 object%2 a marker pattern that is likely to be confused with another object, or another view of itself."},
    {"WarningActiveMarkersOff",
     "%1 smart object%2 markers turned off, because a linked device is plugged in for recharging."},

    {"WarningBadSync", ""},
    {"WarningBatteryCritical", ""},
    {"WarningBatteryLow", ""},
    {"WarningBatteryRecharging", ""},
    {"WarningConnectionIssue", ""},
    {"WarningFirmwareIssue", ""},
    {"WarningHasPendingCommands", ""},
    {"WarningNoRadioChannel", ""},
    {"WarningPreferredMasterConflict", ""},
    {"WarningRadioConflict", ""},
};

}

std::span<const WarningType> WarningTypes()
{
  return types;
}

std::string_view WarningSentence(int typeId)
{
  const auto index = static_cast<std::size_t>(typeId); // of a negative id far past the end
  return index < std::size(types) ? types[index].sentence : std::string_view();
}

std::optional<int> WarningTypeId(std::string_view key)
{
  const auto* type = std::ranges::find(types, key, &WarningType::key);
  if (type == std::end(types))
    return std::nullopt;
  return static_cast<int>(std::distance(std::begin(types), type));
}

}
