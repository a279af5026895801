#include "StandaloneHost/Server/Limits.h"

#include <algorithm>

namespace Server
{

namespace
{

constexpr std::uint64_t kibi = 1024;
constexpr std::uint64_t mebi = kibi * kibi;

constexpr LimitRow rows[] = {
    {&Limits::messageBytes, "messageBytes", "max-message-bytes", kibi, 1024 * mebi, "Length of a message, in bytes."},
    {&Limits::nesting, "nesting", "max-nesting", 4, 1000, "Depth of arrays and objects in a message."},
    {&Limits::batchCalls, "batchCalls", "max-batch-calls", 1, 65536, "Calls in a batch."},
    {&Limits::connections, "connections", "max-connections", 4, 65536, "Connections of all clients together."},
    {&Limits::webSockets, "webSockets", "max-websockets", 1, 65536, "Connections that are WebSockets."},
    {&Limits::subscriptions, "subscriptions", "max-subscriptions", 1, 65536,
     "Callbacks that a connection subscribes to."},
    {&Limits::callsInFlight, "callsInFlight", "max-calls-in-flight", 1, mebi,
     "Calls of a connection at the same time; more wait."},
    {&Limits::callsInFlightOverall, "callsInFlightOverall", "max-calls-in-flight-overall", 1, 16 * mebi,
     "Calls of all connections at the same time; more wait."},
    {&Limits::outgoingBytes, "outgoingBytes", "max-outgoing-bytes", mebi, 4096 * mebi,
     "Bytes that wait for the client to read them; also the longest response."},
    {&Limits::outgoingBytesOverall, "outgoingBytesOverall", "max-outgoing-bytes-overall", mebi, mebi* mebi,
     "Bytes that wait for all clients together; beyond, each has its share only."},
    {&Limits::outgoingNotifications, "outgoingNotifications", "max-outgoing-notifications", 1, mebi,
     "Notifications that wait for the client to read them and may not stand for each other."},
    {&Limits::pingAfterSeconds, "pingAfterSeconds", "ping-after", 1, 3600,
     "Seconds of silence after which a WebSocket client is pinged; as long again, and the connection is ended."}};

}

std::size_t Limits::WebSocketsAmong(std::size_t connections)
{
  const Limits usual;
  return std::max<std::size_t>(1, connections * usual.webSockets / usual.connections);
}

std::span<const LimitRow> LimitRows()
{
  return rows;
}

}
