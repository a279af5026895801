#pragma once

#include "HostInterface/NMX/IPostalService.h"

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <optional>
#include <thread>

namespace Evaluation
{

/// A postal service for change notifications that all say the same, "look again": it runs none of the tasks, but takes
/// note that there was one. [any]
class Bell final : public NMX::IPostalService
{
public:
  using Time = std::chrono::steady_clock::time_point;

  /// What its listener causes itself is no news: a task that the listener's thread posts does not ring.
  void Post(std::function<void()> task) override;

  /// The calling thread is the listener from now on.
  void Listen() { m_listener = std::this_thread::get_id(); }

  void Ring();
  [[nodiscard]] bool Rung() const { return m_rung; }
  void Silence() { m_rung = false; }

  /// Ends the wait of the listener, and every one to come.
  void WakeForGood();

  /// Waits until then, if a time is given; unless `deaf`, until it rings. [listener]
  void Wait(std::optional<Time> end, bool deaf);

private:
  std::mutex m_mutex;
  std::condition_variable m_wake;
  bool m_awake = false;
  std::atomic<bool> m_rung = false;
  std::atomic<std::thread::id> m_listener;
};

}
