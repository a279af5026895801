#pragma once

#include "HostInterface/RunaCorePluginInterface/IDeviceLayoutRegistry.h"

#include <string>
#include <vector>

namespace SmartObjectServices
{

/// Makes the types of device that carry active markers known to the host.
void RegisterDeviceTypes(RunaCorePluginInterface::IDeviceLayoutRegistry& registry);

/// Those of them that clusters of smart objects can be made for.
[[nodiscard]] const std::vector<std::string>& CompatibleDeviceTypes();

}
