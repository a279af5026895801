#pragma once

#include <cstdint>

namespace NMX
{

/// Smart objects: objects with active markers, made of clusters that devices carry.
class ISmartObjectServices
{
public:
  enum class ESmartObjectWarning : std::uint32_t
  {
    DuplicateDevice,
    DuplicatePattern,
    NoPattern,
    DisconnectedDevice,
    MissingDevice,
    DeviceNotLinked,
    ProximityGroupMissingUnique,
    ProximityGroupDuplicateTemplates,
    TemplateGroupNoProximityGroup,
    TemplateGroupNonIdentical,
    TemplateGroupProcessingNotEnabled,
    ObjectConfusion,
    ObjectConfusionCritical,
    ActiveMarkersOff
  };

  virtual ~ISmartObjectServices() = default;
};

}
