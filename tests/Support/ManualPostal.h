#pragma once

#include "HostInterface/NMX/IPostalService.h"

#include <deque>
#include <mutex>
#include <utility>

/// A postal service whose tasks run when the test says so.
class ManualPostal : public NMX::IPostalService
{
public:
  void Post(std::function<void()> task) override
  {
    const std::lock_guard lock(m_mutex);
    m_tasks.push_back(std::move(task));
  }

  /// Runs what has been posted, and what that posts; returns how many tasks ran.
  int RunAll()
  {
    int ran = 0;
    for (auto task = Next(); task; task = Next(), ++ran)
      task();
    return ran;
  }

private:
  std::function<void()> Next()
  {
    const std::lock_guard lock(m_mutex);
    if (m_tasks.empty())
      return nullptr;
    auto task = std::move(m_tasks.front());
    m_tasks.pop_front();
    return task;
  }

  std::mutex m_mutex;
  std::deque<std::function<void()>> m_tasks;
};
