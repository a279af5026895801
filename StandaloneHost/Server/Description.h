#pragma once

#include "StandaloneHost/Server/Registry.h"

#include <string>

namespace Server
{

/// An OpenRPC document of everything in the registry, in the order of registration, followed by the server's own
/// methods.
[[nodiscard]] std::string DescribeApi(const Registry& registry);

}
