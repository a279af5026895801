#pragma once

#include "HostInterface/RunaCorePluginInterface/IDeviceLayoutRegistry.h"

#include <mutex>
#include <set>
#include <string>
#include <string_view>

namespace SmartObjects
{

/// The types of device that the plugin has made known. Nothing in this host needs to know where their markers are.
/// [any]
class DeviceLayouts : public RunaCorePluginInterface::IDeviceLayoutRegistry
{
public:
  void Register(const RunaCorePluginInterface::DeviceLayout& layout) override;

  [[nodiscard]] bool Known(std::string_view type) const;

private:
  mutable std::mutex m_mutex;
  std::set<std::string, std::less<>> m_types;
};

}
