#pragma once

#include "StandaloneHost/Server/Limits.h"

#include <cstddef>
#include <deque>
#include <memory>
#include <string>

namespace Server
{

/// A message on its way to one or many clients.
using SharedMessage = std::shared_ptr<const std::string>;

/// How a message may be treated while it waits.
enum class EPolicy
{
  Reply,   ///< never dropped
  Change,  ///< stands for all earlier ones of its callback: the later takes the earlier one's place
  Sequence ///< each one counts, up to a limit
};

/// What waits to be sent to one client. Over its limits the client is too slow to be served any longer.
class OutgoingQueue
{
public:
  explicit OutgoingQueue(const Limits& limits) : m_limits(limits) {}

  /// False when the client is too slow; the queue is unchanged then. `callback` tells the callbacks apart.
  [[nodiscard]] bool Push(SharedMessage message, EPolicy policy, const void* callback = nullptr);

  /// The next message to send. The queue is not empty.
  [[nodiscard]] SharedMessage Pop();

  void Clear();

  [[nodiscard]] bool Empty() const { return m_waiting.empty(); }
  [[nodiscard]] std::size_t Bytes() const { return m_bytes; }

private:
  struct Waiting
  {
    SharedMessage message;
    EPolicy policy;
    const void* callback;
  };

  const Limits& m_limits;
  std::deque<Waiting> m_waiting;
  std::size_t m_bytes = 0;
  std::size_t m_changes = 0;
  std::size_t m_sequences = 0;
};

}
