#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

namespace Server
{

/// What clients may ask of the server. All of it is told in the greeting, and each limit is an option of the host.
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

  /// A WebSocket client that sends nothing for so many seconds is pinged; as long again without an answer ends the
  /// connection.
  std::size_t pingAfterSeconds = 30;

  /// How many WebSockets there may be among so many connections: enough of them are left for HTTP.
  [[nodiscard]] static std::size_t WebSocketsAmong(std::size_t connections);
};

/// One limit: where it is kept, what it is called, and what it may be.
struct LimitRow
{
  std::size_t Limits::*member;
  std::string_view name;   ///< in the greeting
  std::string_view option; ///< of the host, without the dashes
  std::uint64_t smallest;
  std::uint64_t largest;
  std::string_view description;
};

/// All limits, in the order of the greeting.
[[nodiscard]] std::span<const LimitRow> LimitRows();

}
