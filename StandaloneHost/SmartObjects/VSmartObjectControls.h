#pragma once

#include "HostInterface/ISmartObjectControls.h"
#include "StandaloneHost/SmartObjects/DeviceLayouts.h"
#include "StoreInterface/IStore.h"

#include <memory>

namespace SmartObjects
{

/// Makes the standalone host's smart objects, from templates and for devices, and assigns patterns. [any]
class VSmartObjectControls : public ISmartObjectControls
{
public:
  VSmartObjectControls(std::shared_ptr<NMX::IStore> store, std::shared_ptr<const DeviceLayouts> layouts);

  NMX::IResult CreateFromTemplate(const std::string& name, const std::filesystem::path& file, ECreate create) override;
  NMX::IResult CreateForUnlinkedDevices(std::vector<std::string>& names) override;
  NMX::IResult CreateForDevices(const std::vector<std::string>& urns, ECreate create,
                                std::vector<std::string>& names) override;
  NMX::IResult AssignOptimalPatterns() override;
  NMX::IResult CheckPattern(const NMX::IStoreReader& access, const std::string& clusterType,
                            std::uint32_t pattern) const override;

private:
  NMX::IResult CheckTypes(const NMX::IStoreReader& access) const;

  const std::shared_ptr<NMX::IStore> m_store;
  const std::shared_ptr<const DeviceLayouts> m_layouts;
};

}
