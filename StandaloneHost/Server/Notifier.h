#pragma once

#include "StandaloneHost/Server/OutgoingQueue.h"
#include "StandaloneHost/Server/Registry.h"

#include <deque>
#include <string_view>
#include <vector>

namespace Server
{

/// A client that can be told of changes.
class IListener
{
public:
  virtual void Notify(const SharedMessage& message, EPolicy policy, const void* callback) = 0;

protected:
  ~IListener() = default;
};

/// Passes the plugin's notifications on to whoever subscribed. Each is written as text once, however many listen.
/// [server]
class Notifier
{
public:
  Notifier(const Registry& registry, const Limits& limits) : m_registry(registry), m_limits(limits) {}

  /// Subscribes to one callback, or to all callbacks of a group as "Group.*". `NotFound` for an unknown name,
  /// `NotPermitted` for a callback above `grantedLevel`, `AllocationFailure` over the limit, `OkButNoEffect` when
  /// nothing is new.
  NMX::IResult Subscribe(std::string_view name, IListener& listener, TerminalServer2::Level grantedLevel);
  NMX::IResult Unsubscribe(std::string_view name, IListener& listener);

  /// Ends everything that the listener subscribed to; needed before it goes.
  void Forget(IListener& listener);

  /// Ends all subscriptions.
  void Close();

  /// Counts the notifications of the whole server.
  [[nodiscard]] std::uint64_t Sequence() const { return m_sequence; }

private:
  struct Channel
  {
    const CallbackEntry* callback;
    std::vector<IListener*> listeners;
    NMX::Subscription subscription; // held while anyone listens
  };

  [[nodiscard]] std::vector<Channel*> Find(std::string_view name);
  void Deliver(Channel& channel, const NMX::IServerNotification& notification);

  const Registry& m_registry;
  const Limits& m_limits;
  std::deque<Channel> m_channels; // made when first asked for; a deque, because subscriptions refer to them
  std::uint64_t m_sequence = 0;
};

}
