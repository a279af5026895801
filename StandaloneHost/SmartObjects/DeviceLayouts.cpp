#include "StandaloneHost/SmartObjects/DeviceLayouts.h"

#include <utility>

namespace SmartObjects
{

void DeviceLayouts::Register(const RunaCorePluginInterface::DeviceLayout& layout)
{
  std::vector<NMX::Position> markers;
  for (const auto& [x, y, z] : layout.markers)
    markers.push_back({x, y, z});
  const std::lock_guard lock(m_mutex);
  m_markers.insert_or_assign(std::string(layout.type), std::move(markers));
}

bool DeviceLayouts::Known(std::string_view type) const
{
  const std::lock_guard lock(m_mutex);
  return m_markers.contains(type);
}

}
