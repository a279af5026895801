#pragma once

#include "HostInterface/RunaCorePluginInterface/IDeviceLayoutRegistry.h"

#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace SmartObjectServices
{

/// Makes the types of device that carry active markers known to the host.
void RegisterDeviceTypes(RunaCorePluginInterface::IDeviceLayoutRegistry& registry);

/// The places of a type's markers, in mm in the device's own frame; none for an unknown type. Valid as long as the
/// program runs. [any]
[[nodiscard]] std::span<const RunaCorePluginInterface::MarkerPlace> MarkersOf(std::string_view type);

/// Those of them that clusters of smart objects can be made for.
[[nodiscard]] const std::vector<std::string>& CompatibleDeviceTypes();

}
