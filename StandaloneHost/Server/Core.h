#pragma once

#include "StandaloneHost/Server/Dispatcher.h"
#include "StandaloneHost/Server/Documents.h"
#include "StandaloneHost/Server/Notifier.h"
#include "StandaloneHost/Server/VServer.h"

#include <atomic>
#include <chrono>
#include <cstdint>
#include <memory>
#include <unordered_set>
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

  /// True when what the connection waits for should have come by now.
  [[nodiscard]] virtual bool Overdue(std::chrono::steady_clock::time_point now) const = 0;

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

private:
  std::unordered_set<IConnection*> m_connections;
  std::atomic<std::size_t> m_count{0};
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
  Registry registry;
  Notifier notifier;
  Dispatcher dispatcher;
  Documents documents;
  Connections connections;
  std::uint64_t lastSession = 0;
  bool closing = false;
};

}
