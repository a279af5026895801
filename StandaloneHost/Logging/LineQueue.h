#pragma once

#include "StandaloneHost/Logging/LogLine.h"

#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>

namespace Logging
{

/// The lines of the log that wait to be written, bounded in lines and bytes; what finds no room is counted, and the
/// count stands where the lines would have stood. Its owner guards it.
class LineQueue
{
public:
  static constexpr std::size_t maximalLines = 4096;
  static constexpr std::size_t maximalBytes = 1 << 20;

  /// What is to be written next: so many lines were lost, and then comes this one; or none yet.
  struct Entry
  {
    std::uint64_t lost = 0;
    std::optional<LogLine> line;
  };

  void Push(LogLine line);

  /// A line was lost before it could be pushed.
  void Lose() { ++m_lost; }

  /// Nothing when there is nothing to write.
  [[nodiscard]] std::optional<Entry> Pop();

  /// What was popped has been written, or is lost as well.
  void Written(const Entry& entry, bool success);

private:
  struct Waiting
  {
    std::uint64_t lostBefore;
    LogLine line;
    std::size_t bytes;
  };

  std::deque<Waiting> m_waiting;
  std::size_t m_bytes = 0;
  std::uint64_t m_lost = 0;       ///< after the last line that waits
  std::uint64_t m_notWritten = 0; ///< before the first one
  bool m_failing = false;
};

}
