#pragma once

#include "StandaloneHost/Server/Core.h"

#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>

#include <memory>

namespace Server
{

/// Serves the HTTP requests of a new connection, one after the other, until it ends or becomes a WebSocket. [server]
void StartHttp(boost::asio::basic_stream_socket<boost::asio::ip::tcp, boost::asio::io_context::executor_type> socket,
               std::shared_ptr<Core> core);

/// Tells a new connection that there are too many, and ends it. [server]
void RefuseHttp(boost::asio::basic_stream_socket<boost::asio::ip::tcp, boost::asio::io_context::executor_type> socket,
                std::shared_ptr<Core> core);

}
