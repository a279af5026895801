#include "StandaloneHost/Logging/LineQueue.h"

#include <utility>

namespace Logging
{

void LineQueue::Push(LogLine line)
{
  const std::size_t bytes = sizeof(Waiting) + line.channel.size() + line.text.size();
  if (m_waiting.size() == maximalLines || bytes > maximalBytes - m_bytes)
    return Lose();
  m_waiting.push_back({m_lost, std::move(line), bytes});
  m_bytes += bytes;
  m_lost = 0;
}

std::optional<LineQueue::Entry> LineQueue::Pop()
{
  if (!m_waiting.empty())
  {
    Waiting next = std::move(m_waiting.front());
    m_waiting.pop_front();
    m_bytes -= next.bytes;
    return Entry{next.lostBefore + std::exchange(m_notWritten, 0), std::move(next.line)};
  }
  // What could not be written is told with the next line: to try that alone could go on for ever.
  if (m_failing || m_lost + m_notWritten == 0)
    return std::nullopt;
  return Entry{std::exchange(m_lost, 0) + std::exchange(m_notWritten, 0), std::nullopt};
}

void LineQueue::Written(const Entry& entry, bool success)
{
  m_failing = !success;
  if (!success)
    m_notWritten += entry.lost + (entry.line ? 1 : 0);
}

}
