#pragma once

#include <QSocketNotifier>

/// Ends the calling thread's event loop when SIGINT or SIGTERM comes. They are blocked for all threads, so one that
/// comes before the loop runs waits for it. [host]
class StopSignals
{
public:
  StopSignals();
  StopSignals(const StopSignals&) = delete;
  StopSignals& operator=(const StopSignals&) = delete;
  ~StopSignals();

private:
  const int m_descriptor;
  QSocketNotifier m_notifier;
};
