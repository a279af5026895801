#include "StandaloneHost/Server/OutgoingQueue.h"

#include <algorithm>
#include <utility>

namespace Server
{

bool OutgoingQueue::Push(SharedMessage message, EPolicy policy, const void* callback)
{
  if (policy == EPolicy::Change && m_changes != 0)
  {
    const auto earlier = std::find_if(m_waiting.begin(), m_waiting.end(), [callback](const Waiting& waiting)
                                      { return waiting.policy == EPolicy::Change && waiting.callback == callback; });
    if (earlier != m_waiting.end())
    {
      m_bytes += message->size();
      m_bytes -= earlier->message->size();
      earlier->message = std::move(message);
      return true;
    }
  }
  if (m_bytes + message->size() > m_limits.outgoingBytes)
    return false;
  if (policy == EPolicy::Sequence && m_sequences == m_limits.outgoingNotifications)
    return false;

  m_bytes += message->size();
  m_changes += policy == EPolicy::Change ? 1 : 0;
  m_sequences += policy == EPolicy::Sequence ? 1 : 0;
  m_waiting.push_back({std::move(message), policy, callback});
  return true;
}

SharedMessage OutgoingQueue::Pop()
{
  Waiting first = std::move(m_waiting.front());
  m_waiting.pop_front();
  m_bytes -= first.message->size();
  m_changes -= first.policy == EPolicy::Change ? 1 : 0;
  m_sequences -= first.policy == EPolicy::Sequence ? 1 : 0;
  return std::move(first.message);
}

void OutgoingQueue::Clear()
{
  m_waiting.clear();
  m_bytes = 0;
  m_changes = 0;
  m_sequences = 0;
}

}
