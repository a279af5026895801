#include "StandaloneHost/Server/OutgoingQueue.h"

#include <algorithm>
#include <utility>

namespace Server
{

void OutgoingQueue::Count(std::size_t more, std::size_t less)
{
  m_bytes += more;
  m_bytes -= less;
  m_overall += more;
  m_overall -= less;
}

bool OutgoingQueue::TooMuch(std::size_t size) const
{
  const std::size_t share = m_limits.outgoingBytesOverall / m_limits.connections;
  return m_bytes + size > m_limits.outgoingBytes ||
         (m_overall + size > m_limits.outgoingBytesOverall && m_bytes + size > share);
}

bool OutgoingQueue::Push(SharedMessage message, EPolicy policy, const void* callback)
{
  if (policy == EPolicy::Change && m_changes != 0)
  {
    const auto earlier = std::find_if(m_waiting.begin(), m_waiting.end(), [callback](const Waiting& waiting)
                                      { return waiting.policy == EPolicy::Change && waiting.callback == callback; });
    if (earlier != m_waiting.end())
    {
      Count(message->size(), earlier->message->size());
      earlier->message = std::move(message);
      return true;
    }
  }
  if (TooMuch(message->size()))
    return false;
  if (policy == EPolicy::Sequence && m_sequences == m_limits.outgoingNotifications)
    return false;

  Count(message->size(), 0);
  m_changes += policy == EPolicy::Change ? 1 : 0;
  m_sequences += policy == EPolicy::Sequence ? 1 : 0;
  m_waiting.push_back({std::move(message), policy, callback});
  return true;
}

SharedMessage OutgoingQueue::Pop()
{
  Waiting first = std::move(m_waiting.front());
  m_waiting.pop_front();
  Count(0, first.message->size());
  m_changes -= first.policy == EPolicy::Change ? 1 : 0;
  m_sequences -= first.policy == EPolicy::Sequence ? 1 : 0;
  return std::move(first.message);
}

void OutgoingQueue::Clear()
{
  m_waiting.clear();
  Count(0, m_bytes);
  m_changes = 0;
  m_sequences = 0;
}

}
