#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <map>
#include <memory>
#include <set>
#include <string>

namespace NMX
{

/// Basic objects: rigid bodies with a fixed pattern of passive markers, named by text.
///
/// Operations that take a name answer `NotFound` when no subject has it and `InvalidArgument` when the subject is not
/// a basic object. Outputs are untouched, and nothing has changed, when an operation fails. Operations never throw.
class IBasicObjectServices
{
public:
  enum class EBasicObjectWarning : std::uint32_t
  {
    ProximityGroupMissingUnique,
    ProximityGroupDuplicateTemplates,
    TemplateGroupNoProximityGroup,
    TemplateGroupNonIdentical,
    TemplateGroupProcessingNotEnabled,
    ObjectConfusion,
    ObjectConfusionCritical
  };

  using ChangedCallback = IMultiCallbackPostal<void()>;

  virtual ~IBasicObjectServices() = default;

  virtual IResult BasicObjectList(std::set<std::string>& names) const = 0;

  virtual IResult Remove(const std::string& name) = 0;

  /// Removes all basic objects as far as the store lets it: a single refusal is not reported.
  virtual IResult RemoveAll() = 0;

  /// `InvalidName` when the new name begins or ends with a space or does not match the store's name pattern,
  /// `AlreadyPresent` when another subject of any kind has it.
  virtual IResult Rename(const std::string& oldName, const std::string& newName) = 0;

  virtual IResult Enabled(const std::string& name, bool& enabled) const = 0;
  virtual IResult SetEnabled(const std::string& name, bool enabled) = 0;

  /// Enables or disables all basic objects, or none when one refuses.
  virtual IResult SetAllEnabled(bool enabled) = 0;

  /// Colours are "#aarrggbb". SetColor takes "#RRGGBB" too, which is opaque; `InvalidArgument` for anything else.
  virtual IResult Color(const std::string& name, std::string& colorHtml) const = 0;
  virtual IResult SetColor(const std::string& name, const std::string& colorHtml) = 0;

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
  virtual IResult BasicObjectWarnings(const std::string& name,
                                      std::map<EBasicObjectWarning, std::string>& warnings) const = 0;

  /// Raised whenever a basic object is added, removed or changed.
  virtual std::shared_ptr<ChangedCallback> BasicObjectChangedCallback() = 0;
};

}
