#pragma once

#include "StandaloneHost/Server/ClientStream.h"
#include "StandaloneHost/Server/Core.h"

#include <boost/beast/http/message.hpp>
#include <boost/beast/http/string_body.hpp>

#include <memory>

namespace Server
{

/// Takes over a stream whose client asked for a WebSocket, and serves it until it ends. `offersProtocol`: whether the
/// client is told the protocol that is spoken. [server]
void StartWebSocket(ClientStream stream, const boost::beast::http::request<boost::beast::http::string_body>& request,
                    bool offersProtocol, std::shared_ptr<Core> core);

}
