#include "RunaCorePluginSubjectStore/TerminalServer2/CallQueue.h"

#include <utility>

namespace TerminalServer2
{

bool CallQueue::Queue(const NMX::Caller& caller, std::size_t bytes, Turn turn)
{
  Held& held = m_held.at(caller.id);
  if (bytes > maximumBytes - held.bytes)
    return false;
  held.calls.push_back({bytes, std::move(turn)});
  held.bytes += bytes;
  return true;
}

void CallQueue::PostTurn(const NMX::Caller& caller, Turn turn)
{
  // Weak: a task that is never run must not own what runs it.
  Post(
      [weak = weak_from_this(), caller, turn = std::move(turn)]
      {
        const auto self = weak.lock();
        if (self && !turn())
          self->Continue(caller);
      });
}

/// Each of those who wait has a task of its own, so that other callers' calls come in between.
void CallQueue::Continue(const NMX::Caller& caller)
{
  const auto found = m_held.find(caller.id);
  if (found == m_held.end())
    return;
  Held& held = found->second;
  if (held.calls.empty())
  {
    m_held.erase(found);
    return;
  }
  Waiting next = std::move(held.calls.front());
  held.calls.pop_front();
  held.bytes -= next.bytes;
  PostTurn(caller, std::move(next.turn));
}

}
