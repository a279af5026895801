#pragma once

#include "HostInterface/RunaCorePluginInterface/IDeviceLayoutRegistry.h"
#include "StoreInterface/Value.h"

#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace SmartObjects
{

/// The types of device that the plugin has made known. [any]
class DeviceLayouts : public RunaCorePluginInterface::IDeviceLayoutRegistry
{
public:
  void Register(const RunaCorePluginInterface::DeviceLayout& layout) override;

  [[nodiscard]] bool Known(std::string_view type) const;

private:
  mutable std::mutex m_mutex;
  std::map<std::string, std::vector<NMX::Position>, std::less<>> m_markers; // mm, in the device's own frame
};

}
