#include "StandaloneHost/Logging/LineQueue.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>

using Logging::LineQueue;
using Logging::LogLine;

namespace
{

struct LogQueue : public testing::Test
{
  void Push(const std::string& text) { queue.Push({{}, NMX::ESeverity::Notice, "System", text}); }

  /// "LOST TEXT", both as far as there are any; what is popped is written, or not.
  std::string Pop(bool written = true)
  {
    const auto entry = queue.Pop();
    if (!entry)
      return "nothing";
    queue.Written(*entry, written);
    const std::string text = entry->line ? entry->line->text : "";
    return entry->lost == 0 ? text : std::to_string(entry->lost) + (text.empty() ? "" : " ") + text;
  }

  LineQueue queue;
};

}

TEST_F(LogQueue, IsBoundedAndCountsWhatIsLostWhereItIsLost)
{
  for (std::size_t i = 0; i < LineQueue::maximalLines + 7; ++i)
    Push(std::to_string(i));
  EXPECT_EQ(Pop(), "0");
  EXPECT_EQ(Pop(), "1");
  Push("after the gap");
  Push("next");
  for (std::size_t i = 2; i < LineQueue::maximalLines; ++i)
    ASSERT_EQ(Pop(), std::to_string(i));
  EXPECT_EQ(Pop(), "7 after the gap");
  EXPECT_EQ(Pop(), "next");
  EXPECT_EQ(Pop(), "nothing");

  // In bytes; and nothing comes after the gap.
  const std::string large(LineQueue::maximalBytes / 4, 'x');
  for (int i = 0; i < 6; ++i)
    Push(large);
  for (int i = 0; i < 3; ++i)
    EXPECT_EQ(Pop(), large);
  EXPECT_EQ(Pop(), "3");
  EXPECT_EQ(Pop(), "nothing");
}

TEST_F(LogQueue, TellsWithTheNextLineWhatCouldNotBeWrittenAndDoesNotTryThatAlone)
{
  Push("first");
  Push("second");
  EXPECT_EQ(Pop(false), "first");
  EXPECT_EQ(Pop(false), "1 second");
  EXPECT_EQ(Pop(), "nothing");
  queue.Lose();
  EXPECT_EQ(Pop(), "nothing");
  Push("third");
  EXPECT_EQ(Pop(), "3 third");
  EXPECT_EQ(Pop(), "nothing");
  queue.Lose();
  EXPECT_EQ(Pop(), "1");
}

TEST(LogLine, HasTheLocalTimeWithItsDistanceToUtc)
{
  const LogLine line{std::chrono::system_clock::time_point(std::chrono::milliseconds(1774713909042)),
                     NMX::ESeverity::Warning, "Server", "text"};
  const char* const former = std::getenv("TZ");
  const std::string restored = former != nullptr ? former : "";
  const struct
  {
    const char *zone, *expected;
  } cases[]{{"UTC0", "2026-03-28T16:05:09.042+00:00 warning [Server] text\n"},
            {"XST-5:45", "2026-03-28T21:50:09.042+05:45 warning [Server] text\n"},
            {"XST3:30", "2026-03-28T12:35:09.042-03:30 warning [Server] text\n"}};
  for (const auto& [zone, expected] : cases)
  {
    setenv("TZ", zone, 1);
    tzset();
    EXPECT_EQ(FormatLine(line), expected);
  }
  former != nullptr ? setenv("TZ", restored.c_str(), 1) : unsetenv("TZ");
  tzset();
}
