#pragma once

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Logging/StandardStreams.h"

#include <chrono>
#include <memory>

namespace Logging
{

/// While it lives, the program's log goes to a descriptor, written by a thread of its own: whoever reads there cannot
/// hold up those who log. Repeated messages are folded, and what nobody reads is counted and lost. Only a fatal
/// message, which is the last one, is waited for, as long as the end is. [host]
class LogWriter
{
public:
  /// The end waits so long for what is not written yet; what is not written then is lost.
  explicit LogWriter(int descriptor, std::chrono::milliseconds endTime = patience);
  LogWriter(const LogWriter&) = delete;
  LogWriter& operator=(const LogWriter&) = delete;
  ~LogWriter();

  /// Gets each message that is written or lost, as it is written; an empty one takes its place away. Once this returns,
  /// the one before is no longer called. It must not log. [any]
  void SetListener(NMX::GlobalLog::Sink listener);

  /// Waits until all that was logged is written, at most so long. Answers whether it is. [any]
  bool Flush(std::chrono::milliseconds time);

private:
  struct State;

  const std::shared_ptr<State> m_state; ///< with the thread, which may have to be left behind
  const std::chrono::milliseconds m_endTime;
  NMX::GlobalLog::Sink m_former;
};

}
