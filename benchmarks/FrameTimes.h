#pragma once

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QQuickWindow>
#include <QTimer>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <utility>
#include <vector>

/// Times from frame to frame of a window. [gui]
class FrameTimes
{
public:
  explicit FrameTimes(QQuickWindow& window)
  {
    QObject::connect(
        &window, &QQuickWindow::frameSwapped, &window,
        [this]
        {
          if (m_last.isValid())
            m_milliseconds.push_back(static_cast<double>(m_last.nsecsElapsed()) / 1e6);
          m_last.start();
        },
        Qt::DirectConnection);
  }

  /// Runs the event loop for a time and prints what came of it.
  void Run(const char* what, std::chrono::milliseconds time)
  {
    m_milliseconds.clear();
    m_last.invalidate();
    // Not to quit: that would close the window.
    QTimer::singleShot(time, QCoreApplication::instance(), [] { QCoreApplication::exit(); });
    QCoreApplication::exec();
    if (what != nullptr)
      Report(what);
  }

  [[nodiscard]] std::size_t Count() const { return m_milliseconds.size(); }

private:
  void Report(const char* what)
  {
    std::vector<double>& times = m_milliseconds;
    if (times.empty())
      return (void)std::printf("%s no frames\n", what);
    std::sort(times.begin(), times.end());
    const auto at = [&](double part)
    { return times[static_cast<std::size_t>(part * static_cast<double>(times.size() - 1))]; };
    std::printf("%-22s %6zu frames; from frame to frame: median %.1f ms, 95 %% %.1f, 99 %% %.1f, longest %.1f\n", what,
                times.size(), at(0.5), at(0.95), at(0.99), at(1));
  }

  std::vector<double> m_milliseconds;
  QElapsedTimer m_last;
};
