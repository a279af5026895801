#pragma once

#include <chrono>
#include <cstddef>
#include <functional>
#include <memory>

namespace NMX
{

/// How a job on a file ended.
enum class EFileEnd
{
  Answered, ///< it has run
  TimedOut, ///< the file did not answer in time
  Refused   ///< it was not begun, as every thread hangs in a file
};

/// Runs jobs that look at files on threads of its own, so that a file that does not answer (a dead share) keeps waiting
/// only those who asked for it. Threads start when they are needed. One that hangs is never waited for: what it touches
/// lives as long as it does. [any]
class FileThreads
{
public:
  using Job = std::function<void()>;
  using Ended = std::function<void(EFileEnd)>;

  static constexpr std::size_t maximumThreads = 4;
  static constexpr std::size_t maximumWaiting = 4096;

  /// Those of the program. They are not destroyed at its end, when one of them may hang.
  [[nodiscard]] static FileThreads& OfProgram();

  /// A job has `patience` from the moment that it is asked for.
  explicit FileThreads(std::chrono::milliseconds patience);
  FileThreads(const FileThreads&) = delete;
  FileThreads& operator=(const FileThreads&) = delete;

  /// Waits for nothing. Jobs that have not ended are dropped, and nobody is told.
  ~FileThreads();

  /// Runs `job` as soon as a thread is free; calls `ended` once, on any thread, perhaps before Run returns. A job that
  /// is not done in time ends as `TimedOut`; if it runs, it runs on, so it may touch only what it owns. Neither may
  /// throw; `ended` must not wait for anything.
  void Run(Job job, Ended ended);

  [[nodiscard]] std::chrono::milliseconds Patience() const { return m_patience; }

private:
  struct State;
  const std::chrono::milliseconds m_patience;
  const std::shared_ptr<State> m_state; // the threads' too
};

}
