#pragma once

#include <atomic>
#include <chrono>
#include <cstddef>
#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <unordered_set>
#include <utility>
#include <vector>

namespace Server
{

/// One client's connection, HTTP or WebSocket. [server]
class IConnection
{
public:
  using Clock = std::chrono::steady_clock;

  /// Ends the connection once what waits has been sent.
  virtual void Close() = 0;

  /// Ends the connection at once.
  virtual void Abort() = 0;

  /// Called from time to time: ends a connection whose client takes too long.
  virtual void Tick(Clock::time_point now) = 0;

  /// The process has stood still for so long, which is not to be held against the client.
  virtual void Extend(Clock::duration /*pause*/) {}

  /// Since when the connection has done nothing but wait for its client; nothing while it may not be ended to make room
  /// for another.
  [[nodiscard]] virtual std::optional<Clock::time_point> WaitsSince() const { return {}; }

  /// Since when the connection is there, as long as its client has neither shown a token nor called anything; nothing
  /// afterwards.
  [[nodiscard]] virtual std::optional<Clock::time_point> StrangerSince() const { return {}; }

  /// The client's address, for people.
  [[nodiscard]] virtual std::string Peer() const { return {}; }

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
  using Clock = IConnection::Clock;

  explicit Connections(std::size_t limit) : m_limit(limit) {}

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

  /// The connection that is to end first when there is no room for a newcomer; null when none may. As long as strangers
  /// have more than a small share of the connections, that is the stranger that has been there the longest: so
  /// strangers only keep out each other. Otherwise the one that has been waiting for its client the longest, a second
  /// or more.
  [[nodiscard]] IConnection* FirstToEnd(Clock::time_point now) const;

private:
  const std::size_t m_limit;
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

}
