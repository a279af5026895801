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
    {"Warnings", "", ""},

    {"WarningDuplicateDevice", "%1 smart object%2 duplicate device links.",
     "A device is linked to another cluster too."},
    {"WarningDuplicatePattern", "%1 smart object%2 duplicate patterns.", "Another cluster has the same pattern."},
    {"WarningNoPattern", "%1 smart object%2 not been assigned a pattern.", "A cluster has no pattern."},
    {"WarningEmptySlot", "%1 character%2 unassigned slots.", "A slot is empty."},
    {"WarningCFCChildWarning", "%1 character%2 warnings on assigned clusters.", "An object in a slot has warnings."},
    {"WarningDisconnectedDevice", "%1 smart object%2 a disconnected linked device.",
     "A linked device is disconnected."},
    {"WarningMissingDevice", "%1 smart object%2 a missing linked device.", "A linked device is missing."},
    {"WarningDeviceNotLinked", "%1 smart object%2 empty device links.", "A cluster has no device."},
    {"WarningDuplicateCluster", "%1 labeling cluster%2 identical guids.",
     "Another labelling cluster has the same guid."},
    {"WarningNotCalibrated", "%1 subject%2 not been calibrated.", "It has not been calibrated."},
    {"WarningProximityGroupMissingUnique", "%1 object%2 a proximity group containing no unique objects.",
     "Its proximity group has no unique object."},
    {"WarningProximityGroupDuplicateTemplates", "%1 object%2 duplicate templates in their proximity group.",
     "Its proximity group has a template twice."},
    {"WarningTemplateGroupNoProximityGroup", "%1 object%2 a template group name but no proximity group name.",
     "It has a template group but no proximity group."},
    {"WarningTemplateGroupNonIdentical", "%1 object%2 a template group containing non-identical objects.",
     "The objects of its template group are not identical."},
    {"WarningTemplateGroupProcessingNotEnabled",
     "%1 object%2 a template group name but Proximity Grouping and Object Instance Tracking are both disabled in "
     "Processing.",
     "It has a template group, but processing does not use groups."},
    {"WarningCFCNoReferenceClusterAssigned",
     "%1 character%2 no reference cluster assigned (one with auto-assign disabled).",
     "No reference cluster is assigned (one with auto-assign off)."},
    {"WarningInsufficientAutoAssignCandidates",
     "%1 character%2 more empty slots than there are auto-assignable objects to fill them.",
     "There are fewer objects to assign than empty slots."},
    {"WarningObjectConfusion",
     "%1 object%2 a marker pattern that could be confused with another object, or another view of itself.",
     "It could be confused with another object, or another view of itself."},
    {"WarningObjectConfusionCritical",
     "%1 object%2 a marker pattern that is likely to be confused with another object, or another view of itself.",
     "It is likely to be confused with another object, or another view of itself."},
    {"WarningActiveMarkersOff",
     "%1 smart object%2 markers turned off, because a linked device is plugged in for recharging.",
     "Its markers are off while a device is recharging."},

    {"WarningBadSync", "", "A device is out of sync."},
    {"WarningBatteryCritical", "", "A device's battery is nearly empty."},
    {"WarningBatteryLow", "", "A device's battery is low."},
    {"WarningBatteryRecharging", "", "A device is recharging."},
    {"WarningConnectionIssue", "", "A device has a poor connection."},
    {"WarningFirmwareIssue", "", "A device has the wrong firmware."},
    {"WarningHasPendingCommands", "", "A device has commands waiting."},
    {"WarningNoRadioChannel", "", "A device has no radio channel."},
    {"WarningPreferredMasterConflict", "", "Two devices are preferred as master."},
    {"WarningRadioConflict", "", "Two devices use the same radio channel."},
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
