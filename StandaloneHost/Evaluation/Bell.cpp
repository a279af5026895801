#include "StandaloneHost/Evaluation/Bell.h"

namespace Evaluation
{

void Bell::Post(std::function<void()> /*task*/)
{
  if (std::this_thread::get_id() != m_listener.load())
    Ring();
}

void Bell::Ring()
{
  if (m_rung.exchange(true))
    return;
  const std::lock_guard lock(m_mutex);
  m_wake.notify_all();
}

void Bell::WakeForGood()
{
  const std::lock_guard lock(m_mutex);
  m_awake = true;
  m_wake.notify_all();
}

void Bell::Wait(std::optional<Time> end, bool deaf)
{
  std::unique_lock lock(m_mutex);
  const auto called = [&] { return m_awake || (!deaf && m_rung); };
  if (end)
    m_wake.wait_until(lock, *end, called);
  else
    m_wake.wait(lock, called);
}

}
