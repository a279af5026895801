#pragma once

#include "HostInterface/LoggingDetail/GlobalLogStream.h"

#include <atomic>
#include <functional>
#include <source_location>
#include <string>
#include <string_view>

namespace NMX
{

/// How grave a message is. A channel passes the messages whose number is not above its level.
enum class ESeverity
{
  Fatal = 0,
  Critical = 1,
  Error = 2,
  Warning = 3,
  Notice = 4,
  Info = 5,
  Debug = 6,
  Trace = 7
};

/// As a line of the log has it: "warning".
[[nodiscard]] std::string_view SeverityName(ESeverity severity);

/// One message on its way to where logs go.
struct LogRecord
{
  std::string_view channel;
  ESeverity severity;
  std::string_view text;
  std::string_view file;
  unsigned line;
};

/// The program's log. All channels share one level; messages go to one sink. [any]
class GlobalLog
{
public:
  using Sink = std::function<void(const LogRecord&)>;

  /// Replaces the sink, which starts as one line on standard error for each message (an empty one is that again), and
  /// answers the one before. The sink is never called by two threads at once and must not log.
  static Sink SetSink(Sink sink);

  static void SetLevel(ESeverity level);

  [[nodiscard]] static bool Enabled(ESeverity severity);

  /// Hands a finished message to the sink. Never throws.
  static void Write(const LogRecord& record) noexcept;
};

/// A named channel of the log, such as "System".
struct LogChannel
{
  std::string_view name;
};

inline constexpr LogChannel systemLog{"System"};
inline constexpr LogChannel subjectStoreLog{"SubjectStore"};
inline constexpr LogChannel serverLog{"Server"};

/// A message text with placeholders "%1%", "%2%", … that remembers where it stands in the source.
struct LogFormat
{
  template <class Text>
  LogFormat(const Text& format, std::source_location where = std::source_location::current())
      : text(format), location(where)
  {
  }

  std::string_view text;
  std::source_location location;
};

/// Logs a message. The level is checked before anything is formatted; a message that cannot be formatted is replaced
/// by a fixed text that names it. Never throws.
template <class... Arguments>
void Log(const LogChannel& channel, ESeverity severity, LogFormat format, const Arguments&... arguments) noexcept
{
  if (!GlobalLog::Enabled(severity))
    return;
  LoggingDetail::GlobalLogStream stream(format.text);
  (stream.Add(arguments), ...);
  const std::string text = stream.Text();
  GlobalLog::Write({channel.name, severity, text, format.location.file_name(), format.location.line()});
}

}
