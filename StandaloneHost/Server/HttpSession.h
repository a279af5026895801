#pragma once

#include "StandaloneHost/Server/ClientStream.h"
#include "StandaloneHost/Server/Core.h"

#include <memory>
#include <string>

namespace Server
{

/// Serves the HTTP requests of a new connection, one after the other, until it ends or becomes a WebSocket. `peer`: the
/// client's address, for people. [server]
void StartHttp(Socket socket, std::string peer, std::shared_ptr<Core> core);

/// Ends a new connection because there are too many, and says so if that takes no handshake. [server]
void RefuseHttp(Socket socket, std::string peer, std::shared_ptr<Core> core);

}
