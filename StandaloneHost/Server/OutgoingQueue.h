#pragma once

#include "StandaloneHost/Server/Limits.h"
#include "StandaloneHost/Server/OutgoingBytes.h"
#include "StandaloneHost/Server/ResponseText.h"

#include <cstddef>
#include <deque>
#include <memory>

namespace Server
{

/// A message on its way to one or many clients.
using SharedMessage = std::shared_ptr<const ResponseText>;

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
  OutgoingQueue(const Limits& limits, std::shared_ptr<OutgoingBytes> outgoing)
      : m_limits(limits), m_held(std::move(outgoing))
  {
  }
  OutgoingQueue(const OutgoingQueue&) = delete;
  OutgoingQueue& operator=(const OutgoingQueue&) = delete;

  /// False when the client is too slow, or when too much waits for all clients and more than its share for this one;
  /// the queue is unchanged then. `callback` tells the callbacks apart.
  [[nodiscard]] bool Push(SharedMessage message, EPolicy policy, const void* callback = nullptr);

  /// The next message to send, and what takes it out of the queue. The queue is not empty.
  [[nodiscard]] const SharedMessage& Front() const { return m_waiting.front().message; }
  void Pop();

  void Clear();

  [[nodiscard]] bool Empty() const { return m_waiting.empty(); }
  [[nodiscard]] std::size_t Bytes() const { return m_length; }

private:
  struct Waiting
  {
    SharedMessage message;
    EPolicy policy;
    const void* callback;
  };

  void Count(const ResponseText& message);
  void Uncount(const ResponseText& message);

  const Limits& m_limits;
  HeldBytes m_held; // what is not shared
  std::size_t m_length = 0;
  std::deque<Waiting> m_waiting;
  std::size_t m_changes = 0;
  std::size_t m_sequences = 0;
};

}
