#include "StandaloneHost/Server/Connections.h"

#include <algorithm>

namespace Server
{

namespace
{

constexpr auto keptTime = std::chrono::seconds(1); // a client that calls is not idle before
constexpr std::size_t strangersShare = 16;         // of the connections: one in so many

/// The longest of those for whom `since` has an answer.
struct Longest
{
  void Consider(IConnection* candidate, std::optional<IConnection::Clock::time_point> candidateSince)
  {
    if (!candidateSince)
      return;
    ++count;
    if (connection == nullptr || *candidateSince < since)
    {
      connection = candidate;
      since = *candidateSince;
    }
  }

  IConnection* connection = nullptr;
  IConnection::Clock::time_point since{};
  std::size_t count = 0;
};

}

IConnection* Connections::FirstToEnd(Clock::time_point now) const
{
  Longest stranger;
  Longest idle;
  for (IConnection* connection : m_connections)
  {
    stranger.Consider(connection, connection->StrangerSince());
    idle.Consider(connection, connection->WaitsSince());
  }
  const bool fewStrangers = stranger.count < std::max<std::size_t>(1, m_limit / strangersShare);
  if (fewStrangers && idle.connection != nullptr && idle.since < now - keptTime)
    return idle.connection;
  return stranger.connection;
}

}
