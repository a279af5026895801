#pragma once

#include "StandaloneHost/Server/ClientStream.h"
#include "StandaloneHost/Server/Core.h"

#include <memory>

namespace Server
{

/// Serves the HTTP requests of a new connection, one after the other, until it ends or becomes a WebSocket. [server]
void StartHttp(Socket socket, std::shared_ptr<Core> core);

/// Ends a new connection because there are too many, and says so if that takes no handshake. [server]
void RefuseHttp(Socket socket, std::shared_ptr<Core> core);

}
