#pragma once

#include "StandaloneHost/Server/Registry.h"

#include <string>

namespace Server
{

/// An AsyncAPI document of what is told over a WebSocket: the greeting, every callback of the registry in the order of
/// registration, and how they are subscribed to. "send" is what the server does.
[[nodiscard]] std::string DescribeEvents(const Registry& registry);

}
