#pragma once

#include "HostInterface/NMX/IResult.h"
#include "HostInterface/NMX/ITypedId.h"

namespace NMX
{
class IEntryEditor;
}

namespace RunaCorePluginInterface
{

/// Gives objects the settings of a preset. [any]
class IObjectPresetProvider
{
public:
  IObjectPresetProvider() = default;
  IObjectPresetProvider(const IObjectPresetProvider&) = delete;
  IObjectPresetProvider& operator=(const IObjectPresetProvider&) = delete;
  virtual ~IObjectPresetProvider() = default;

  /// Copies the parameters of a preset to a subject, in the given edit access, which the caller commits; the subject
  /// remembers the preset's name. Parameters that the subject does not have are passed over. `NotFound` when there is
  /// no such preset, `InvalidId` when there is no such subject, `InvalidType` for one that is no object, or a parameter
  /// of the wrong type; where it fails, the caller lets go of the access.
  virtual NMX::IResult Apply(NMX::IEntryEditor& access, NMX::TSubjectStoreId preset, NMX::TSubjectStoreId subject) = 0;
};

}
