#pragma once

#include "HostInterface/RunaCorePluginInterface/IObjectPresetProvider.h"

namespace Panel
{

/// The presets of the store. [any]
class VObjectPresetProvider final : public RunaCorePluginInterface::IObjectPresetProvider
{
public:
  NMX::IResult Apply(NMX::IEntryEditor& access, NMX::TSubjectStoreId preset, NMX::TSubjectStoreId subject) override;
};

}
