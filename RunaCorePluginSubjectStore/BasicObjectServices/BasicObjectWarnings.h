#pragma once

#include "HostInterface/TerminalServer2/Records.h"
#include "RunaCorePluginSubjectStore/BasicObjectServices/IBasicObjectServices.h"

#include <array>

namespace NMX
{

/// The warnings of a basic object: value, name and text.
inline constexpr std::array basicObjectWarningsValues{
    TerminalServer2::EnumerationValue{"ProximityGroupMissingUnique", 0, "Proximity group has no unique object."},
    TerminalServer2::EnumerationValue{"ProximityGroupDuplicateTemplates", 1,
                                      "Proximity group contains more than one instance from the same template group."},
    TerminalServer2::EnumerationValue{"TemplateGroupNoProximityGroup", 2,
                                      "Object is in a template group, but isn't in a proximity group."},
    TerminalServer2::EnumerationValue{"TemplateGroupNonIdentical", 3, "Template group contains non-identical objects."},
    TerminalServer2::EnumerationValue{
        "TemplateGroupProcessingNotEnabled", 4,
        "Template groups require either Proximity Grouping or Object Instance Tracking to be enabled in processing."},
    TerminalServer2::EnumerationValue{"ObjectConfusion", 5,
                                      "Object could be confused with another object, or another view of itself."},
    TerminalServer2::EnumerationValue{
        "ObjectConfusionCritical", 6,
        "Object is likely to be confused with another object, or another view of itself."}};

inline constexpr TerminalServer2::TypeRecord basicObjectWarnings{
    "BasicObjectServices.EBasicObjectWarning", "Basic object warning types.", basicObjectWarningsValues};

constexpr const TerminalServer2::TypeRecord& DocumentedType(IBasicObjectServices::EBasicObjectWarning)
{
  return basicObjectWarnings;
}

}
