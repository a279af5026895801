#include "HostInterface/NMX/GlobalLog.h"

#include <array>
#include <cstdio>
#include <mutex>
#include <utility>

namespace NMX
{

namespace
{

std::atomic<int> level{static_cast<int>(ESeverity::Notice)};

void WriteToStandardError(const LogRecord& record)
{
  static constexpr std::array<const char*, 8> names{"fatal",  "critical", "error", "warning",
                                                    "notice", "info",     "debug", "trace"};
  std::fprintf(stderr, "%s [%.*s] %.*s\n", names[static_cast<std::size_t>(record.severity)],
               static_cast<int>(record.channel.size()), record.channel.data(), static_cast<int>(record.text.size()),
               record.text.data());
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
