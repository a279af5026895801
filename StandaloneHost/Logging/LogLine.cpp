#include "StandaloneHost/Logging/LogLine.h"

#include <array>
#include <cstdio>
#include <cstdlib>
#include <ctime>

namespace Logging
{

namespace
{

/// ISO 8601 to the millisecond, with the distance to UTC.
std::string TimeText(std::chrono::system_clock::time_point time)
{
  const auto sinceEpoch = std::chrono::floor<std::chrono::milliseconds>(time.time_since_epoch());
  const auto seconds = std::chrono::floor<std::chrono::seconds>(sinceEpoch);
  const std::time_t whole = seconds.count();
  std::tm parts{};
  localtime_r(&whole, &parts);
  std::array<char, 32> date{};
  std::strftime(date.data(), date.size(), "%Y-%m-%dT%H:%M:%S", &parts);
  const auto minutes = std::labs(parts.tm_gmtoff) / 60;
  std::array<char, 64> text{};
  std::snprintf(text.data(), text.size(), "%s.%03d%c%02ld:%02ld", date.data(),
                static_cast<int>((sinceEpoch - seconds).count()), parts.tm_gmtoff < 0 ? '-' : '+', minutes / 60,
                minutes % 60);
  return text.data();
}

}

std::string FormatLine(const LogLine& line)
{
  std::string text = TimeText(line.time);
  text.append(" ").append(NMX::SeverityName(line.severity));
  return text.append(" [").append(line.channel).append("] ").append(line.text).append("\n");
}

}
