#pragma once

#include "HostInterface/NMX/GlobalLog.h"

#include <chrono>
#include <cstddef>
#include <string>

namespace Logging
{

/// How much of a message is shown. A line with it and all that stands before it goes into a pipe in one piece.
inline constexpr std::size_t longestText = 2048;

/// A message as a line of the log, in printable characters.
struct LogLine
{
  std::chrono::system_clock::time_point time;
  NMX::ESeverity severity;
  std::string channel;
  std::string text;
};

/// "2026-03-28T17:05:09.042+01:00 notice [Server] TEXT" and the end of the line; the time is local.
[[nodiscard]] std::string FormatLine(const LogLine& line);

}
