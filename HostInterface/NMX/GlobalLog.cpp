#include "HostInterface/NMX/GlobalLog.h"

#include "HostInterface/LoggingDetail/PrintableText.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <mutex>
#include <utility>

namespace NMX
{

namespace
{

std::atomic<int> level{static_cast<int>(ESeverity::Notice)};

constexpr std::size_t longestText = 4096;

/// For programs that set no sink. Whoever reads standard error can hold it up.
void WriteToStandardError(const LogRecord& record)
{
  std::string line(SeverityName(record.severity));
  line.append(" [").append(record.channel).append("] ");
  line.append(LoggingDetail::PrintableText(record.text, longestText)).append("\n");
  std::fputs(line.c_str(), stderr);
}

std::mutex& SinkMutex()
{
  static std::mutex mutex;
  return mutex;
}

GlobalLog::Sink& CurrentSink()
{
  static GlobalLog::Sink sink = &WriteToStandardError;
  return sink;
}

}

std::string_view SeverityName(ESeverity severity)
{
  static constexpr std::array<std::string_view, 8> names{"fatal",  "critical", "error", "warning",
                                                         "notice", "info",     "debug", "trace"};
  return names[std::min(static_cast<std::size_t>(severity), names.size() - 1)];
}

GlobalLog::Sink GlobalLog::SetSink(Sink sink)
{
  const std::lock_guard lock(SinkMutex());
  return std::exchange(CurrentSink(), sink ? std::move(sink) : Sink{&WriteToStandardError});
}

void GlobalLog::SetLevel(ESeverity newLevel)
{
  level.store(static_cast<int>(newLevel), std::memory_order_relaxed);
}

bool GlobalLog::Enabled(ESeverity severity)
{
  return static_cast<int>(severity) <= level.load(std::memory_order_relaxed);
}

void GlobalLog::Write(const LogRecord& record) noexcept
{
  try
  {
    const std::lock_guard lock(SinkMutex());
    CurrentSink()(record);
  }
  catch (...)
  {
    std::fputs("a log message was lost\n", stderr);
  }
}

}
