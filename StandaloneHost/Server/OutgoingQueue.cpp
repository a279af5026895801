#include "StandaloneHost/Server/OutgoingQueue.h"

#include <algorithm>
#include <utility>

namespace Server
{

void OutgoingQueue::Count(const ResponseText& message)
{
  m_length += message.Size();
  m_held.Add(message.OwnBytes());
}

void OutgoingQueue::Uncount(const ResponseText& message)
{
  m_length -= message.Size();
  m_held.Remove(message.OwnBytes());
}

bool OutgoingQueue::Push(SharedMessage message, EPolicy policy, const void* callback)
{
  if (policy == EPolicy::Change && m_changes != 0)
  {
    const auto earlier = std::find_if(m_waiting.begin(), m_waiting.end(),
                                      [callback](const Waiting& waiting)
                                      { return waiting.policy == EPolicy::Change && waiting.callback == callback; });
    if (earlier != m_waiting.end())
    {
      Uncount(*earlier->message);
      Count(*message);
      earlier->message = std::move(message);
      return true;
    }
  }
  if (m_length + message->Size() > m_limits.outgoingBytes || !m_held.MayAdd(message->OwnBytes()))
    return false;
  if (policy == EPolicy::Sequence && m_sequences == m_limits.outgoingNotifications)
    return false;

  Count(*message);
  m_changes += policy == EPolicy::Change ? 1 : 0;
  m_sequences += policy == EPolicy::Sequence ? 1 : 0;
  m_waiting.push_back({std::move(message), policy, callback});
  return true;
}

void OutgoingQueue::Pop()
{
  const Waiting& first = m_waiting.front();
  Uncount(*first.message);
  m_changes -= first.policy == EPolicy::Change ? 1 : 0;
  m_sequences -= first.policy == EPolicy::Sequence ? 1 : 0;
  m_waiting.pop_front();
}

void OutgoingQueue::Clear()
{
  m_waiting.clear();
  m_held.Set(0);
  m_length = 0;
  m_changes = 0;
  m_sequences = 0;
}

}
