#pragma once

#include <chrono>
#include <thread>

/// Waits until something holds, and does `step` again and again meanwhile; false when it does not come to that in time.
template <class Condition, class Step>
[[nodiscard]] bool Eventually(Condition condition, Step step, std::chrono::seconds limit = std::chrono::seconds(20))
{
  using Clock = std::chrono::steady_clock;
  for (const auto end = Clock::now() + limit; Clock::now() < end; step())
    if (condition())
      return true;
  return condition();
}

template <class Condition>
[[nodiscard]] bool Eventually(Condition condition)
{
  return Eventually(condition, [] { std::this_thread::sleep_for(std::chrono::milliseconds(1)); });
}
