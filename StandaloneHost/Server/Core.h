#pragma once

#include "StandaloneHost/Server/Dispatcher.h"
#include "StandaloneHost/Server/Documents.h"
#include "StandaloneHost/Server/Notifier.h"
#include "StandaloneHost/Server/Refusals.h"
#include "StandaloneHost/Server/VServer.h"

#include <boost/asio/ssl/context.hpp>

#include <atomic>
#include <chrono>
#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <unordered_set>
#include <utility>
#include <vector>

namespace Server
{

/// One client's connection, HTTP or WebSocket. [server]
class IConnection
{
public:
  /// Ends the connection once what waits has been sent.
  virtual void Close() = 0;

  /// Ends the connection at once.
  virtual void Abort() = 0;

  /// Called from time to time: ends a connection whose client takes too long.
  virtual void Tick(std::chrono::steady_clock::time_point now) = 0;

  /// Since when the connection has done nothing but wait for its client; nothing while it may not be ended to make room
  /// for another.
  [[nodiscard]] virtual std::optional<std::chrono::steady_clock::time_point> WaitsSince() const { return {}; }

  /// Reads on after it has had to wait for the calls of others.
  virtual void ReadOn() {}

  [[nodiscard]] virtual std::weak_ptr<IConnection> Weak() = 0;

protected:
  ~IConnection() = default;
};

/// All connections that there are. [server]
class Connections
{
public:
  void Add(IConnection& connection)
  {
    m_connections.insert(&connection);
    m_count.store(m_connections.size(), std::memory_order_relaxed);
  }
  void Remove(IConnection& connection)
  {
    m_connections.erase(&connection);
    m_count.store(m_connections.size(), std::memory_order_relaxed);
  }
  /// [any]
  [[nodiscard]] std::size_t Count() const { return m_count.load(std::memory_order_relaxed); }

  /// Calls `step` for each; a connection may end meanwhile.
  template <class Step>
  void ForEach(Step step)
  {
    std::vector<std::weak_ptr<IConnection>> all;
    all.reserve(m_connections.size());
    for (IConnection* connection : m_connections)
      all.push_back(connection->Weak());
    for (const auto& weak : all)
      if (const auto connection = weak.lock())
        step(*connection);
  }

  /// The connection that has been waiting for its client the longest, if that was before `limit`; null when there is
  /// none.
  [[nodiscard]] IConnection* LongestWaiting(std::chrono::steady_clock::time_point limit) const
  {
    IConnection* longest = nullptr;
    for (IConnection* connection : m_connections)
      if (const auto since = connection->WaitsSince(); since && *since < limit)
      {
        limit = *since;
        longest = connection;
      }
    return longest;
  }

private:
  std::unordered_set<IConnection*> m_connections;
  std::atomic<std::size_t> m_count{0};
};

/// The calls of all connections that wait for their answers. A connection that finds no room reads on when there is
/// some again. [server]
class CallsInFlight
{
public:
  explicit CallsInFlight(std::size_t limit) : m_limit(limit) {}

  /// False when there are too many; `connection` is kept, as it waits for nothing else, and told to read on.
  [[nodiscard]] bool MayBegin(std::shared_ptr<IConnection> connection)
  {
    if (m_count < static_cast<std::ptrdiff_t>(m_limit))
      return true;
    m_waiting.push_back(std::move(connection));
    return false;
  }

  /// Calls that have begun, or ended when negative: answers may come before it is known how many calls there were.
  void Count(std::ptrdiff_t calls)
  {
    m_count += calls;
    while (m_count < static_cast<std::ptrdiff_t>(m_limit) && !m_waiting.empty())
    {
      const auto next = std::move(m_waiting.front());
      m_waiting.pop_front();
      next->ReadOn();
    }
  }

private:
  const std::size_t m_limit;
  std::ptrdiff_t m_count = 0;
  std::deque<std::shared_ptr<IConnection>> m_waiting;
};

/// What the connections of a server share. [server]
struct Core
{
  Core(ServerOptions serverOptions, std::string epoch)
      : options(std::move(serverOptions)), notifier(registry, options.limits),
        dispatcher(registry, notifier, options.limits, options.grantedLevel, std::move(epoch))
  {
  }

  const ServerOptions options;
  std::unique_ptr<boost::asio::ssl::context> tls; ///< none: nothing is encrypted
  Registry registry;
  Notifier notifier;
  Dispatcher dispatcher;
  Documents documents;
  Connections connections;
  Refusals refusals;
  CallsInFlight calls{options.limits.callsInFlightOverall};
  std::size_t outgoingBytes = 0; ///< waiting for all clients to read them
  std::size_t webSockets = 0;    ///< of the connections
  std::uint64_t lastSession = 0;
  std::uint64_t lastCaller = 0; ///< each connection is one
  bool closing = false;
};

}
