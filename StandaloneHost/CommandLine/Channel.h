#pragma once

#include "StandaloneHost/CommandLine/Loop.h"
#include "StandaloneHost/CommandLine/Target.h"

#include <memory>
#include <optional>
#include <string>

namespace CommandLine
{

/// A WebSocket to a host. Its operations throw HostError when the connection is lost or refused, and Ended.
class IChannel
{
public:
  virtual ~IChannel() = default;

  /// Sends a text message; the target's time-out bounds it.
  virtual void Send(const std::string& message) = 0;

  /// The next message; nothing when none has come by then.
  [[nodiscard]] virtual std::optional<std::string> Receive(Loop::Clock::time_point deadline) = 0;

  /// Takes leave of the host, for which it does not wait long. Throws nothing.
  virtual void Close() = 0;
};

/// Connects to the host, in TLS when the target says so, within its time-out. Follows no redirection. The loop has to
/// outlive the channel.
[[nodiscard]] std::shared_ptr<IChannel> Connect(const Target& target, Loop& loop);

}
