#pragma once

#include <chrono>
#include <functional>
#include <memory>

namespace boost::asio
{
class io_context;
}

namespace CommandLine
{

/// Runs what a command has under way, and knows when the command is to end. One thread.
class Loop
{
public:
  using Clock = std::chrono::steady_clock;

  Loop();
  Loop(const Loop&) = delete;
  Loop& operator=(const Loop&) = delete;
  ~Loop();

  [[nodiscard]] boost::asio::io_context& Context();

  /// From here on SIGINT and SIGTERM end the loop instead of the process.
  void HearSignals();

  /// From here on the loop ends when the reader of standard output has gone. A pipe says so at once, while a write
  /// would find out with the next notification.
  void WatchOutput();

  /// Runs until `done` answers true; answers false when the time was up before. Throws Ended.
  bool RunUntil(const std::function<bool()>& done, Clock::time_point deadline);

  /// The same, even after the end has come.
  bool Finish(const std::function<bool()>& done, Clock::time_point deadline);

  /// Throws Ended.
  void Sleep(std::chrono::milliseconds time);

  /// SIGINT or SIGTERM; 0 when none has come.
  [[nodiscard]] int Signal() const;

private:
  struct Parts;

  const std::unique_ptr<Parts> m_parts;
};

}
