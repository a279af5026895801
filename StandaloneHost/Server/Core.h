#pragma once

#include "StandaloneHost/Server/Connections.h"
#include "StandaloneHost/Server/Dispatcher.h"
#include "StandaloneHost/Server/Documents.h"
#include "StandaloneHost/Server/Notifier.h"
#include "StandaloneHost/Server/OutgoingBytes.h"
#include "StandaloneHost/Server/Refusals.h"
#include "StandaloneHost/Server/VServer.h"

#include <boost/asio/ssl/context.hpp>

#include <cstdint>
#include <memory>
#include <utility>

namespace Server
{

/// What the connections of a server share. [server]
struct Core
{
  Core(ServerOptions serverOptions, std::string epoch)
      : options(std::move(serverOptions)), notifier(registry, options.limits),
        dispatcher(registry, notifier, options.limits, outgoing, options.grantedLevel, std::move(epoch))
  {
  }

  const ServerOptions options;
  std::unique_ptr<boost::asio::ssl::context> tls; ///< none: nothing is encrypted
  const std::shared_ptr<OutgoingBytes> outgoing = std::make_shared<OutgoingBytes>(options.limits);
  Registry registry;
  Notifier notifier;
  Dispatcher dispatcher;
  Documents documents;
  Connections connections{options.limits.connections};
  Refusals refusals;
  CallsInFlight calls{options.limits.callsInFlightOverall};
  std::size_t webSockets = 0; ///< of the connections
  std::uint64_t lastSession = 0;
  std::uint64_t lastCaller = 0; ///< each connection is one
  bool closing = false;
};

}
