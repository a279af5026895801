#include "StandaloneHost/Logging/LogWriter.h"

#include "StandaloneHost/Logging/LogLine.h"
#include "tests/Support/LogCapture.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/mman.h>
#include <sys/resource.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <csignal>
#include <future>
#include <regex>
#include <thread>

using Logging::LogWriter;
using NMX::ESeverity;
using testing::ElementsAre;
using namespace std::chrono_literals;

namespace
{

/// A pipe in the place of standard error.
struct Pipe
{
  Pipe()
  {
    std::signal(SIGPIPE, SIG_IGN); // as in the host
    EXPECT_EQ(pipe2(ends.data(), O_CLOEXEC), 0);
  }
  Pipe(const Pipe&) = delete;
  Pipe& operator=(const Pipe&) = delete;
  ~Pipe()
  {
    close(ends[0]);
    close(ends[1]);
  }

  [[nodiscard]] int In() const { return ends[1]; }

  /// The messages that have come, without what stands before them.
  std::vector<std::string> Messages()
  {
    fcntl(ends[0], F_SETFL, O_NONBLOCK);
    std::array<char, 65536> part;
    for (ssize_t size; (size = read(ends[0], part.data(), part.size())) > 0;)
      text.append(part.data(), static_cast<std::size_t>(size));
    std::vector<std::string> messages;
    for (std::size_t end; (end = text.find('\n')) != std::string::npos; text.erase(0, end + 1))
      messages.push_back(text.substr(text.find("] ") + 2, end - text.find("] ") - 2));
    return messages;
  }

  std::array<int, 2> ends{};
  std::string text;
};

/// Each from a place of its own, so that none is folded.
void LogApart(unsigned count, const std::string& text)
{
  for (unsigned line = 0; line < count; ++line)
    NMX::GlobalLog::Write({"System", ESeverity::Notice, text, __FILE__, line});
}

auto TimeOf(const auto& work)
{
  const auto begin = std::chrono::steady_clock::now();
  work();
  return std::chrono::steady_clock::now() - begin;
}

}

TEST(LogWriter, WritesLinesInOrderThatHoldNothingButText)
{
  LogCapture former;
  Pipe pipe;
  {
    LogWriter writer(pipe.In());
    std::vector<std::string> heard;
    writer.SetListener([&](const NMX::LogRecord& record) { heard.emplace_back(record.text); });
    NMX::Log(NMX::systemLog, ESeverity::Notice, "%1%", "one\ntwo \x1b[2J");
    NMX::Log(NMX::serverLog, ESeverity::Error, "three");
    writer.SetListener(nullptr);
    NMX::Log(NMX::serverLog, ESeverity::Error, "four");
    EXPECT_TRUE(writer.Flush(10s));
    EXPECT_THAT(heard, ElementsAre("one\\ntwo \\x1b[2J", "three"));
    EXPECT_THAT(pipe.Messages(), ElementsAre("one\\ntwo \\x1b[2J", "three", "four"));
    NMX::Log(NMX::serverLog, ESeverity::Error, "at the end");
  }
  EXPECT_THAT(pipe.Messages(), ElementsAre("at the end"));
  NMX::Log(NMX::systemLog, ESeverity::Notice, "as before");
  EXPECT_THAT(former.messages, ElementsAre("as before"));
}

TEST(LogWriter, HoldsNobodyUpWhenNobodyReadsAndTellsWhatWasLost)
{
  LogCapture former;
  Pipe pipe;
  LogWriter writer(pipe.In());
  constexpr unsigned each = 400;
  constexpr std::size_t threads = 4;
  const auto taken = TimeOf(
      []
      {
        std::vector<std::jthread> loggers;
        for (std::size_t i = 0; i < threads; ++i)
          loggers.emplace_back([i] { LogApart(each, std::string(1500, static_cast<char>('a' + i))); });
      });
  EXPECT_LT(taken, 2s);
  EXPECT_FALSE(writer.Flush(1ms));
  std::vector<std::string> messages;
  while (!writer.Flush(1ms))
    for (std::string& message : pipe.Messages())
      messages.push_back(std::move(message));
  for (std::string& message : pipe.Messages())
    messages.push_back(std::move(message));
  const std::regex gap("(\\d+) lines of the log were lost here.*");
  std::size_t lost = 0;
  std::smatch match;
  for (const std::string& message : messages)
    if (std::regex_match(message, match, gap))
      lost += std::stoul(match[1]) - 1;
  EXPECT_GT(lost, each);
  EXPECT_EQ(messages.size() + lost, threads * each);
}

TEST(LogWriter, EndsInTimeAlthoughNobodyReads)
{
  LogCapture former;
  Pipe pipe;
  const auto taken = TimeOf(
      [&]
      {
        LogWriter writer(pipe.In(), 100ms);
        LogApart(400, std::string(1500, 'x'));
        NMX::Log(NMX::systemLog, ESeverity::Fatal, "the last");
      });
  EXPECT_LT(taken, 2s);
  NMX::Log(NMX::systemLog, ESeverity::Notice, "by nobody");
  EXPECT_TRUE(former.messages.empty()) << "as that may be what is not read";
}

TEST(LogWriter, WaitsForAFatalMessage)
{
  LogCapture former;
  Pipe pipe;
  LogWriter writer(pipe.In(), 10s);
  NMX::Log(NMX::systemLog, ESeverity::Fatal, "the last");
  EXPECT_THAT(pipe.Messages(), ElementsAre("the last"));
}

TEST(LogWriter, GoesOnAfterAFileCouldNotGrow)
{
  LogCapture former;
  const int file = memfd_create("log", MFD_CLOEXEC);
  std::signal(SIGXFSZ, SIG_IGN); // as in the host
  rlimit limit{};
  getrlimit(RLIMIT_FSIZE, &limit);
  LogWriter writer(file);
  const rlimit low{70, limit.rlim_max};
  setrlimit(RLIMIT_FSIZE, &low);
  LogApart(3, "no room for all of it, and none for the next");
  EXPECT_TRUE(writer.Flush(10s));
  setrlimit(RLIMIT_FSIZE, &limit);
  NMX::Log(NMX::systemLog, ESeverity::Notice, "room again");
  EXPECT_TRUE(writer.Flush(10s));
  std::string text(1000, '\0');
  text.resize(static_cast<std::size_t>(std::max<ssize_t>(0, pread(file, text.data(), text.size(), 0))));
  close(file);
  EXPECT_TRUE(
      std::regex_match(text, std::regex(".* no room[^\n]*\n[^\n]* 3 lines of the log were lost here: nobody took "
                                        "them\\.\n[^\n]* room again\n")))
      << text;
}

TEST(LogWriter, TellsAtTheEndWhatWasHeldBack)
{
  LogCapture former;
  Pipe pipe;
  {
    const LogWriter writer(pipe.In());
    for (int i = 0; i < 1000; ++i)
      NMX::Log(NMX::systemLog, ESeverity::Error, "Failed: %1%", i);
  }
  const auto messages = pipe.Messages();
  EXPECT_EQ(messages.front(), "Failed: 0");
  std::smatch match;
  ASSERT_TRUE(
      std::regex_match(messages.back(), match, std::regex("Left out (\\d+) more like this in \\d+ s: Failed: .*")));
  EXPECT_EQ(messages.size() - 1 + std::stoul(match[1]), 1000U);
}
