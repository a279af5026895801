#include "StandaloneHost/Logging/LogWriter.h"

#include "HostInterface/LoggingDetail/PrintableText.h"
#include "StandaloneHost/Logging/Folding.h"
#include "StandaloneHost/Logging/LineQueue.h"

#include <condition_variable>
#include <fcntl.h>
#include <mutex>
#include <string>
#include <thread>
#include <unistd.h>
#include <utility>

namespace Logging
{

namespace
{

using Clock = Folding::Clock;

constexpr std::size_t longestChannel = 64;

/// Both lines in one piece, so that no other program's come between them.
std::string TextOf(const LineQueue::Entry& entry)
{
  const auto time = entry.line ? entry.line->time : std::chrono::system_clock::now();
  std::string text;
  if (entry.lost != 0)
    text = FormatLine({time, NMX::ESeverity::Warning, std::string(NMX::systemLog.name),
                       std::to_string(entry.lost) + " lines of the log were lost here: nobody took them."});
  return entry.line ? text + FormatLine(*entry.line) : text;
}

}

struct LogWriter::State
{
  explicit State(int original) : descriptor(fcntl(original, F_DUPFD_CLOEXEC, 0)) {}
  State(const State&) = delete;
  State& operator=(const State&) = delete;
  ~State() { close(descriptor); }

  void Take(const NMX::LogRecord& record) noexcept;
  void ReportHeldBack(Clock::time_point now, bool all = false) noexcept;
  void Accept(const NMX::LogRecord& record);
  void Wake();
  bool WaitUntilIdle(std::chrono::milliseconds time);
  void End();

  void Run();
  bool Write(const LineQueue::Entry& entry) noexcept;

  const int descriptor;    // its own: a thread that is left behind must not meet another file of that number
  bool lineBroken = false; ///< only the beginning of the latest line was written; of the writing thread
  std::mutex mutex;        // for all that follows
  std::condition_variable wake;
  std::condition_variable idle;
  Folding folding;
  LineQueue queue;
  NMX::GlobalLog::Sink listener;
  bool busy = true;
  bool ending = false;
};

/// Runs in the thread that logs, which waits for nobody here.
void LogWriter::State::Take(const NMX::LogRecord& record) noexcept
{
  const std::lock_guard lock(mutex);
  const auto now = Clock::now();
  ReportHeldBack(now);
  const auto nextReport = folding.NextReport();
  try
  {
    if (record.severity == NMX::ESeverity::Fatal || folding.Passes(record, now))
      Accept(record);
  }
  catch (...)
  {
    queue.Lose();
  }
  if (folding.NextReport() != nextReport)
    Wake();
}

void LogWriter::State::ReportHeldBack(Clock::time_point now, bool all) noexcept
{
  try
  {
    for (const Folding::Report& report : folding.Reports(now, all))
      Accept({report.channel, report.severity, report.text, {}, 0});
  }
  catch (...)
  {
    queue.Lose();
  }
}

void LogWriter::State::Accept(const NMX::LogRecord& record)
{
  LogLine line{std::chrono::system_clock::now(), record.severity,
               LoggingDetail::PrintableText(record.channel, longestChannel),
               LoggingDetail::PrintableText(record.text, longestText)};
  if (listener)
    listener({line.channel, line.severity, line.text, record.file, record.line});
  queue.Push(std::move(line));
  Wake();
}

void LogWriter::State::Wake()
{
  if (!std::exchange(busy, true))
    wake.notify_one();
}

bool LogWriter::State::WaitUntilIdle(std::chrono::milliseconds time)
{
  std::unique_lock lock(mutex);
  return idle.wait_for(lock, time, [this] { return !busy; });
}

void LogWriter::State::End()
{
  const std::lock_guard lock(mutex);
  ReportHeldBack(Clock::now(), true);
  ending = true;
  Wake();
}

void LogWriter::State::Run()
{
  std::unique_lock lock(mutex);
  for (;;)
  {
    ReportHeldBack(Clock::now());
    if (const auto entry = queue.Pop())
    {
      lock.unlock();
      const bool written = Write(*entry);
      lock.lock();
      queue.Written(*entry, written);
      continue;
    }
    busy = false;
    idle.notify_all();
    if (ending)
      return;
    if (const auto due = folding.NextReport())
      wake.wait_until(lock, *due, [this] { return busy; });
    else
      wake.wait(lock, [this] { return busy; });
    busy = true;
  }
}

bool LogWriter::State::Write(const LineQueue::Entry& entry) noexcept
{
  bool begun = false;
  bool written = false;
  try
  {
    written = WriteAll(descriptor, lineBroken ? '\n' + TextOf(entry) : TextOf(entry), begun);
  }
  catch (...)
  {
    written = false;
  }
  lineBroken = !written && (begun || lineBroken);
  return written;
}

LogWriter::LogWriter(int descriptor, std::chrono::milliseconds endTime)
    : m_state(std::make_shared<State>(descriptor)), m_endTime(endTime)
{
  std::thread([state = m_state] { state->Run(); }).detach();
  m_former = NMX::GlobalLog::SetSink(
      [state = m_state, endTime](const NMX::LogRecord& record)
      {
        state->Take(record);
        if (record.severity == NMX::ESeverity::Fatal)
          state->WaitUntilIdle(endTime);
      });
}

LogWriter::~LogWriter()
{
  // What is logged from here on must not be held up either.
  NMX::GlobalLog::SetSink([](const NMX::LogRecord&) {});
  m_state->End();
  if (Flush(m_endTime))
    NMX::GlobalLog::SetSink(m_former);
}

void LogWriter::SetListener(NMX::GlobalLog::Sink listener)
{
  const std::lock_guard lock(m_state->mutex);
  m_state->listener = std::move(listener);
}

bool LogWriter::Flush(std::chrono::milliseconds time)
{
  return m_state->WaitUntilIdle(time);
}

}
