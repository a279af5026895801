#pragma once

#include "StandaloneHost/Server/Core.h"

#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/beast/http/message.hpp>
#include <boost/beast/http/string_body.hpp>

#include <memory>

namespace Server
{

/// Takes over a socket whose client asked for a WebSocket, and serves it until it ends. [server]
void StartWebSocket(
    boost::asio::basic_stream_socket<boost::asio::ip::tcp, boost::asio::io_context::executor_type> socket,
    boost::beast::http::request<boost::beast::http::string_body> request, std::shared_ptr<Core> core);

}
