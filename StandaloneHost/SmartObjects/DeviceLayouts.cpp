#include "StandaloneHost/SmartObjects/DeviceLayouts.h"

namespace SmartObjects
{

void DeviceLayouts::Register(const RunaCorePluginInterface::DeviceLayout& layout)
{
  const std::lock_guard lock(m_mutex);
  m_types.emplace(layout.type);
}

bool DeviceLayouts::Known(std::string_view type) const
{
  const std::lock_guard lock(m_mutex);
  return m_types.contains(type);
}

}
