#pragma once

#include <chrono>
#include <cstddef>

namespace Server
{

/// What clients may ask of the server. All of it is told in the greeting.
struct Limits
{
  std::size_t messageBytes = std::size_t{1} << 20;
  std::size_t nesting = 32; ///< of arrays and objects in a message
  std::size_t batchCalls = 256;
  std::size_t connections = 1100;
  std::size_t webSockets = 1024;                             ///< of the connections
  std::size_t subscriptions = 64;                            ///< of one connection
  std::size_t callsInFlight = 1024;                          ///< of one connection; more wait in the socket
  std::size_t callsInFlightOverall = 65536;                  ///< likewise, of all connections
  std::size_t outgoingBytes = std::size_t{8} << 20;          ///< waiting for one connection to read them
  std::size_t outgoingBytesOverall = std::size_t{256} << 20; ///< of all connections; then each has its share only
  std::size_t outgoingNotifications = 256; ///< waiting for one connection, of those that may not be merged

  /// A WebSocket client that sends nothing for so long is pinged; as long again without an answer ends the connection.
  std::chrono::seconds pingAfter{30};
};

}
