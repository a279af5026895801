#pragma once

#include "HostInterface/TerminalServer2/Records.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/ISmartObjectServices.h"

#include <array>

namespace NMX
{

/// The warnings of a smart object: those of its devices and patterns, then those of every object.
inline constexpr std::array smartObjectWarningsValues{
    TerminalServer2::EnumerationValue{"DuplicateDevice", 0, "A linked device is also linked to another smart object."},
    TerminalServer2::EnumerationValue{"DuplicatePattern", 1,
                                      "Enabled smart object pattern conflicts with another enabled smart object."},
    TerminalServer2::EnumerationValue{"NoPattern", 2, "Enabled smart object has no pattern defined."},
    TerminalServer2::EnumerationValue{"DisconnectedDevice", 3, "Smart object is linked to a disconnected device."},
    TerminalServer2::EnumerationValue{"MissingDevice", 4, "Smart object is linked to a missing device."},
    TerminalServer2::EnumerationValue{"DeviceNotLinked", 5, "Smart object has one or more empty device links."},
    TerminalServer2::EnumerationValue{"ProximityGroupMissingUnique", 6, "Proximity group has no unique object."},
    TerminalServer2::EnumerationValue{"ProximityGroupDuplicateTemplates", 7,
                                      "Proximity group contains more than one instance from the same template group."},
    TerminalServer2::EnumerationValue{"TemplateGroupNoProximityGroup", 8,
                                      "Object is in a template group, but isn't in a proximity group."},
    TerminalServer2::EnumerationValue{"TemplateGroupNonIdentical", 9, "Template group contains non-identical objects."},
    TerminalServer2::EnumerationValue{
        "TemplateGroupProcessingNotEnabled", 10,
        "Template groups require either Proximity Grouping or Object Instance Tracking to be enabled in processing."},
    TerminalServer2::EnumerationValue{"ObjectConfusion", 11,
                                      "Object could be confused with another object, or another view of itself."},
    TerminalServer2::EnumerationValue{
        "ObjectConfusionCritical", 12,
        "Object is likely to be confused with another object, or another view of itself."},
    TerminalServer2::EnumerationValue{
        "ActiveMarkersOff", 13,
        "Smart object markers are turned off, because a linked device is plugged in for recharging."}};

inline constexpr TerminalServer2::TypeRecord smartObjectWarnings{
    "SmartObjectServices.ESmartObjectWarning", "Smart object warning types.", smartObjectWarningsValues};

constexpr const TerminalServer2::TypeRecord& DocumentedType(ISmartObjectServices::ESmartObjectWarning)
{
  return smartObjectWarnings;
}

}
