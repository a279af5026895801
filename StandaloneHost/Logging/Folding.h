#pragma once

#include "HostInterface/NMX/GlobalLog.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace Logging
{

/// Decides which messages go on when one place of the source has many, so that nobody can fill the log by making it
/// say the same again, with other details: so many bytes at once and so many per second from each place, and the same
/// text once in a while. What is held back is counted and reported. Its owner guards it.
class Folding
{
public:
  using Clock = std::chrono::steady_clock;

  static constexpr std::size_t burstBytes = 16 << 10;
  static constexpr std::size_t bytesPerSecond = 100;
  static constexpr auto reportTime = std::chrono::seconds(10);

  /// What has been held back of one place, as a message of the same kind.
  struct Report
  {
    std::string channel;
    NMX::ESeverity severity;
    std::string text;
  };

  /// Whether the message goes on. The first of a place does.
  [[nodiscard]] bool Passes(const NMX::LogRecord& record, Clock::time_point now);

  /// What has been held back for long enough, or, at the end, all that has been; it counts as reported.
  [[nodiscard]] std::vector<Report> Reports(Clock::time_point now, bool all = false);

  /// When there will be something to report; nothing while nothing is held back.
  [[nodiscard]] std::optional<Clock::time_point> NextReport() const { return m_nextReport; }

private:
  struct Place
  {
    [[nodiscard]] bool Matches(const NMX::LogRecord& record) const;

    std::string channel;
    NMX::ESeverity severity;
    std::string file;
    unsigned line;
    std::size_t lastText = 0; ///< hash of the last one that went on
    Clock::time_point lastPassed{};
    Clock::time_point paidUntil{}; ///< each byte costs time; a burst is paid for afterwards
    std::uint64_t heldBack = 0;
    Clock::time_point heldBackSince{};
    std::string example{}; ///< the beginning of the first message that was held back
  };

  Place& PlaceOf(const NMX::LogRecord& record);
  void HoldBack(Place& place, std::string_view text, Clock::time_point now);

  std::vector<Place> m_places;
  std::optional<Clock::time_point> m_nextReport;
};

}
