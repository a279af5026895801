#include "StandaloneHost/CommandLine/ProgressDisplay.h"

#include "StandaloneHost/CommandLine/Layout.h"

#include <algorithm>
#include <cstdio>
#include <unistd.h>

namespace CommandLine
{

namespace
{

constexpr std::size_t barWidth = 30;

unsigned Percent(const Count& count)
{
  if (count.required == 0)
    return 0;
  const double part = static_cast<double>(std::min(count.done, count.required)) / static_cast<double>(count.required);
  return static_cast<unsigned>(part * 100);
}

}

std::string Bar(const Count& count, std::size_t width)
{
  const unsigned percent = Percent(count);
  const std::size_t filled = width * percent / 100;
  const std::string number = std::to_string(percent);
  return '[' + std::string(filled, '#') + std::string(width - filled, '-') + "] " +
         std::string(3 - number.size(), ' ') + number + '%';
}

ProgressDisplay::ProgressDisplay() : m_width(TerminalWidth(STDERR_FILENO)) {}

ProgressDisplay::~ProgressDisplay()
{
  if (m_drawn)
    std::fputc('\n', stderr);
}

void ProgressDisplay::Show(const std::string& text, const std::optional<Count>& count)
{
  if (m_width == 0)
  {
    // What is counted changes all the time; its tenths are the steps.
    const std::string step = count ? std::to_string(Percent(*count) / 10) : text;
    if (step == m_shown)
      return;
    m_shown = step;
    std::fprintf(stderr, "%s\n", (count ? std::to_string(Percent(*count)) + "%  " + text : text).c_str());
    return;
  }
  const std::string line = count ? Bar(*count, barWidth) + "  " + text : text;
  if (line == m_shown)
    return;
  m_shown = line;
  m_drawn = true;
  std::fprintf(stderr, "\r%s\x1b[K", Wrap(line, m_width - 1).front().c_str());
  std::fflush(stderr);
}

}
