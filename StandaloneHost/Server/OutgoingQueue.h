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
  /// `overall` counts the bytes that wait for all clients, and outlives the queue.
  OutgoingQueue(const Limits& limits, std::size_t& overall) : m_limits(limits), m_overall(overall) {}
  ~OutgoingQueue() { Clear(); }
  OutgoingQueue(const OutgoingQueue&) = delete;
  OutgoingQueue& operator=(const OutgoingQueue&) = delete;

  /// False when the client is too slow, or when too much waits for all clients and more than its share for this one;
  /// the queue is unchanged then. `callback` tells the callbacks apart.
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

  void Count(std::size_t more, std::size_t less);
  [[nodiscard]] bool TooMuch(std::size_t size) const;

  const Limits& m_limits;
  std::size_t& m_overall;
  std::deque<Waiting> m_waiting;
  std::size_t m_bytes = 0;
  std::size_t m_changes = 0;
  std::size_t m_sequences = 0;
};

}
