#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

namespace NMX
{

/// Smart objects: objects with active markers, made of clusters that devices carry. A cluster blinks an active marker
/// pattern, and is linked to a device by the device's URN.
///
/// Operations that take a name answer `NotFound` when no subject has it and `InvalidArgument` when the subject is not
/// a smart object; those that take the index of a cluster, from 0, `InvalidIndex` when there is no such cluster.
/// Outputs are untouched, and nothing has changed, when an operation fails. Operations never throw.
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

  using ChangedCallback = IMultiCallbackPostal<void()>;

  virtual ~ISmartObjectServices() = default;

  virtual IResult SmartObjectList(std::set<std::string>& names) const = 0;

  /// Makes a smart object from the default template, or from the template file at that path (UTF-8). `NotSupported` in
  /// a host that cannot make any, `InvalidName`, `AlreadyPresent`; `FileNotFound` when there is no such file, `Failed`
  /// when it is no template.
  virtual IResult Add(const std::string& name) = 0;
  virtual IResult AddFromTemplate(const std::string& name, const std::string& templatePath) = 0;

  virtual IResult Remove(const std::string& name) = 0;

  /// Removes all smart objects as far as the store lets it: a single refusal is not reported.
  virtual IResult RemoveAll() = 0;

  /// `InvalidName` when the new name begins or ends with a space or does not match the store's name pattern,
  /// `AlreadyPresent` when another subject of any kind has it.
  virtual IResult Rename(const std::string& oldName, const std::string& newName) = 0;

  /// The types of device that clusters can be made for.
  virtual IResult CompatibleDeviceTypes(std::vector<std::string>& deviceTypes) const = 0;

  /// Makes a smart object for each device that none is linked to. `NotSupported` in a host that cannot make any, or
  /// when no pattern set serves all; `NotFound` for a device of a type that is not compatible, `AllocationFailure` when
  /// there are more devices than patterns left.
  virtual IResult CreateSmartObjects() = 0;

  /// Gives each cluster of each smart object a pattern of its own; those for which there is none get 0. `NotSupported`
  /// as above, `NotFound` for an unknown type of cluster.
  virtual IResult AssignOptimalActiveMarkerPatterns() = 0;

  /// Whether the host assigns patterns by itself when clusters come and go.
  virtual IResult AutoPatternManagementEnabled(bool& enabled) const = 0;
  virtual IResult SetAutoPatternManagementEnabled(bool enabled) = 0;

  virtual IResult SmartClusterCount(const std::string& name, std::uint32_t& count) const = 0;
  virtual IResult SmartClusterLabel(const std::string& name, std::uint32_t index, std::string& label) const = 0;
  virtual IResult SetSmartClusterLabel(const std::string& name, std::uint32_t index, const std::string& label) = 0;

  /// The pattern of a cluster, from 1; 0 for none. `InvalidValue` for one that is not in the present pattern set.
  virtual IResult SmartClusterActiveMarkerPattern(const std::string& name, std::uint32_t index,
                                                  std::uint32_t& pattern) const = 0;
  virtual IResult SetSmartClusterActiveMarkerPattern(const std::string& name, std::uint32_t index,
                                                     std::uint32_t pattern) = 0;

  /// The URN of the device that a cluster is linked to; an empty text for none. The device need not be there.
  virtual IResult SmartClusterDeviceURN(const std::string& name, std::uint32_t index, std::string& deviceUrn) const = 0;
  virtual IResult SetSmartClusterDeviceURN(const std::string& name, std::uint32_t index,
                                           const std::string& deviceUrn) = 0;

  virtual IResult Enabled(const std::string& name, bool& enabled) const = 0;
  virtual IResult SetEnabled(const std::string& name, bool enabled) = 0;

  /// Enables or disables all smart objects, or none when one refuses.
  virtual IResult SetAllEnabled(bool enabled) = 0;

  /// Colours are "#aarrggbb". SetColor takes "#RRGGBB" too, which is opaque; `InvalidArgument` for anything else.
  virtual IResult Color(const std::string& name, std::string& colorHtml) const = 0;
  virtual IResult SetColor(const std::string& name, const std::string& colorHtml) = 0;

  /// Whether the markers stay on while a linked device is plugged in for recharging.
  virtual IResult ActiveMarkersOnWhileCharging(const std::string& name, bool& onWhileCharging) const = 0;
  virtual IResult SetActiveMarkersOnWhileCharging(const std::string& name, bool onWhileCharging) = 0;

  /// An object in no group answers an empty text, and leaves its group with one.
  virtual IResult ProximityGroupName(const std::string& name, std::string& groupName) const = 0;
  virtual IResult SetProximityGroupName(const std::string& name, const std::string& groupName) = 0;
  virtual IResult TemplateGroupName(const std::string& name, std::string& groupName) const = 0;
  virtual IResult SetTemplateGroupName(const std::string& name, const std::string& groupName) = 0;

  virtual IResult AutoAssignEnabled(const std::string& name, bool& enabled) const = 0;
  virtual IResult SetAutoAssignEnabled(const std::string& name, bool enabled) = 0;

  /// The name of the character slot that the object is in, under which it is output then. `NotSet` unless it is in one
  /// and auto-assign is enabled for it.
  virtual IResult AutoAssignedName(const std::string& name, std::string& autoAssignedName) const = 0;

  /// The warnings that hold, each with its text.
  virtual IResult SmartObjectWarnings(const std::string& name,
                                      std::map<ESmartObjectWarning, std::string>& warnings) const = 0;

  /// Raised whenever a smart object is added, removed or changed.
  virtual std::shared_ptr<ChangedCallback> SmartObjectChangedCallback() = 0;
};

}
