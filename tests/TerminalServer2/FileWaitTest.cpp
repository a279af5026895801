#include "RunaCorePluginSubjectStore/TerminalServer2/VServerFunction.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/SlowFiles.h"

#include <gmock/gmock.h>

#include <atomic>
#include <chrono>
#include <map>
#include <random>
#include <stdexcept>
#include <thread>

using NMX::EResult;
using NMX::IResult;
using namespace TerminalServer2;
using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

namespace
{

using Signature = IResult(const std::string&);
using Function = VServerFunction<Signature>;

constexpr ArgumentText texts[] = {{"Name", ""}};

/// What an operation does that needs a file: it changes nothing before it has the file.
IResult Read(const std::string& file)
{
  const auto text = NMX::LookAtFile(file, &SlowFiles::Text);
  return text && *text == file ? EResult::Ok : EResult::FileIOFailure;
}

/// Functions of one group, whose strand runs when the test says so.
class FileWaitTest : public testing::Test
{
protected:
  std::shared_ptr<Function> Make(const char* name, Function::Callable callable)
  {
    return NMX::MakeShared<Function>(FunctionRecord{name, "", texts, ""}, std::move(callable), queue);
  }

  /// Has a caller call a function; `ended` tells of the end, as "caller argument result".
  void Call(std::uint64_t caller, const std::shared_ptr<Function>& function, const std::string& argument)
  {
    const std::string text = "[\"" + argument + "\"]";
    std::string_view rest = text;
    function->Invoke(
        rest, NMX::Caller{caller},
        [this, caller, argument](const NMX::IServerReply& reply)
        { ended.push_back(std::to_string(caller) + ' ' + argument + ' ' + std::string(reply.Result().Name())); });
  }

  /// Runs the strand until so many calls have ended, for a while at most.
  void RunUntilEnded(std::size_t count)
  {
    const auto late = std::chrono::steady_clock::now() + 20s;
    while (postal->RunAll() != 0 || (ended.size() < count && std::chrono::steady_clock::now() < late))
      std::this_thread::sleep_for(1ms);
  }

  std::vector<std::string> Ended(std::size_t count)
  {
    RunUntilEnded(count);
    return std::exchange(ended, {});
  }

  void UsePatience(std::chrono::milliseconds patience)
  {
    threads = std::make_unique<NMX::FileThreads>(patience);
    queue = std::make_shared<CallQueue>(postal, *threads);
    read = Make("Group.Read", &Read);
    plain = Make("Group.Plain", [](const std::string&) { return EResult::Ok; });
  }

  std::shared_ptr<ManualPostal> postal = std::make_shared<ManualPostal>();
  std::unique_ptr<NMX::FileThreads> threads = std::make_unique<NMX::FileThreads>(1min);
  std::shared_ptr<CallQueue> queue = std::make_shared<CallQueue>(postal, *threads);
  std::shared_ptr<Function> read = Make("Group.Read", &Read);
  std::shared_ptr<Function> plain = Make("Group.Plain", [](const std::string&) { return EResult::Ok; });
  std::vector<std::string> ended;
  const SlowFiles files; // lets go of the threads first
};

}

TEST_F(FileWaitTest, OnlyTheCallersOwnCallsOfTheGroupWaitAndTheyKeepTheirOrder)
{
  files.Kill("dead");
  Call(1, read, "dead");
  Call(1, plain, "x");
  Call(2, plain, "y");
  Call(1, read, "live");
  Call(2, read, "live");
  Call(1, plain, "z");
  EXPECT_THAT(Ended(2), ElementsAre("2 y Ok", "2 live Ok"));
  Call(3, read, "other");
  Call(1, plain, "late");
  EXPECT_THAT(Ended(1), ElementsAre("3 other Ok"));
  const auto ofAnotherGroup = NMX::MakeShared<Function>(
      FunctionRecord{"Other.Plain", "", texts, ""}, [](const std::string&) { return EResult::Ok; },
      std::make_shared<CallQueue>(postal, *threads));
  Call(1, ofAnotherGroup, "elsewhere");
  EXPECT_THAT(Ended(1), ElementsAre("1 elsewhere Ok"));
  for (int i = 0; i < 9; ++i)
    Call(1, plain, std::string(std::size_t{1} << 20, 'm'));
  ASSERT_EQ(Ended(2).size(), 2) << "too much of one caller does not wait";
  Call(1, plain, "last");
  files.Revive("dead");
  const auto all = Ended(13);
  ASSERT_EQ(all.size(), 13);
  EXPECT_THAT(std::vector(all.begin(), all.begin() + 5),
              ElementsAre("1 dead Ok", "1 x Ok", "1 live Ok", "1 z Ok", "1 late Ok"));
  EXPECT_EQ(all.back(), "1 last Ok");
  Call(1, plain, "x");
  EXPECT_EQ(postal->RunAll(), 1) << "nobody waits any more";
}

TEST_F(FileWaitTest, CallsThatHaveWaitedLeaveOthersTheirTurn)
{
  const auto calling = Make("Group.Calling",
                            [&](const std::string&)
                            {
                              Call(2, plain, "between");
                              return EResult::Ok;
                            });
  files.Kill("dead");
  Call(1, read, "dead");
  Call(1, calling, "a");
  Call(1, plain, "b");
  postal->RunAll();
  files.Revive("dead");
  EXPECT_THAT(Ended(4), ElementsAre("1 dead Ok", "1 a Ok", "2 between Ok", "1 b Ok"));
}

TEST_F(FileWaitTest, ACallMayNeedSeveralFilesButNotAnyNumber)
{
  const auto several = Make("Group.Several",
                            [](const std::string& names) -> IResult
                            {
                              for (const char name : names)
                                if (const IResult found = Read(std::string(1, name)); found.Failed())
                                  return found;
                              return EResult::Ok;
                            });
  const LogCapture log;
  Call(1, several, "abba");
  Call(1, several, "abcde");
  EXPECT_THAT(Ended(2), ElementsAre("1 abba Ok", "1 abcde FileIOFailure"));
  EXPECT_THAT(log.messages, ElementsAre(HasSubstr("\"e\" is not looked at")));
  EXPECT_EQ(files.Looks("a"), 2) << "once for each call";

  // Where a call cannot wait, files are looked at in place.
  const auto unposted = NMX::MakeShared<Function>(FunctionRecord{"Group.Read", "", texts, ""}, &Read, nullptr);
  Call(1, unposted, "a");
  EXPECT_THAT(ended, ElementsAre("1 a Ok"));
  EXPECT_TRUE(Read("a").Succeeded());
}

TEST_F(FileWaitTest, AFileHasItsTimeAndWhatItAnswersLaterIsDropped)
{
  UsePatience(50ms);
  const LogCapture log;
  files.Kill("dead\n2");
  Call(1, read, "dead\\n2");
  Call(1, plain, "x");
  EXPECT_THAT(Ended(2), ElementsAre("1 dead\\n2 FileIOFailure", "1 x Ok"));
  EXPECT_THAT(log.messages, ElementsAre("Group.Read: \"dead 2\" did not answer within 0.05 s"));
  files.Revive("dead\n2");
  files.WaitUntilLooking(0);
  Call(1, read, "dead\\n2");
  EXPECT_THAT(Ended(1), ElementsAre("1 dead\\n2 Ok"));
  EXPECT_EQ(files.Looks("dead\n2"), 2) << "the late answer was not kept";
}

TEST_F(FileWaitTest, WhileEveryThreadHangsCallsAreRefusedAtOnce)
{
  UsePatience(300ms);
  LogCapture log;
  for (const char* file : {"a", "b", "c", "d"})
    files.Kill(file);
  for (const char* file : {"a", "b", "c", "d"})
    Call(file[0], read, file);
  postal->RunAll();
  files.WaitUntilLooking(4);
  Call(1, read, "live"); // all are busy, and might come back in time
  EXPECT_THAT(Ended(5), testing::UnorderedElementsAre("97 a FileIOFailure", "98 b FileIOFailure", "99 c FileIOFailure",
                                                      "100 d FileIOFailure", "1 live FileIOFailure"));
  EXPECT_EQ(files.Looks("live"), 0);
  EXPECT_EQ(std::exchange(log.messages, {}).size(), 5);

  Call(1, read, "live");
  Call(1, plain, "x");
  postal->RunAll(); // no time passes
  EXPECT_THAT(std::exchange(ended, {}), ElementsAre("1 live FileIOFailure", "1 x Ok"));
  EXPECT_THAT(log.messages, ElementsAre("Group.Read: \"live\" is not looked at, as too many files do not answer"));
  files.Revive("a");
  do // the thread that came back takes a moment to say so
    Call(1, read, "live");
  while (Ended(1).front() != "1 live Ok");
}

TEST_F(FileWaitTest, ACancelledCallEndsOnceAndOthersThatWaitedGoOn)
{
  files.Kill("dead");
  Call(1, read, "dead");
  Call(1, plain, "x");
  Call(1, read, "live");
  postal->RunAll();
  files.WaitUntilLooking(1);
  read->FinishOutstanding(EResult::ShuttingDown);
  EXPECT_THAT(std::exchange(ended, {}), testing::UnorderedElementsAre("1 dead ShuttingDown", "1 live ShuttingDown"));
  files.Revive("dead");
  EXPECT_THAT(Ended(1), ElementsAre("1 x Ok"));
  EXPECT_EQ(files.Looks("live"), 0);

  // Cancelled while it runs: it does not begin to wait.
  const auto cancelled = Make("Group.Cancelled",
                              [&](const std::string& file)
                              {
                                read->FinishOutstanding(EResult::Canceled);
                                return Read(file);
                              });
  read = cancelled;
  Call(1, cancelled, "dead");
  EXPECT_THAT(Ended(1), ElementsAre("1 dead Canceled"));

  // Nobody has to be there any more when the file answers.
  files.Kill("dead");
  Call(1, plain, "x");
  read = Make("Group.Read", &Read);
  Call(1, read, "dead");
  postal->RunAll();
  read->FinishOutstanding(EResult::ShuttingDown);
  EXPECT_THAT(std::exchange(ended, {}), ElementsAre("1 x Ok", "1 dead ShuttingDown"));
  const std::weak_ptr<Function> weak = read;
  read.reset();
  EXPECT_TRUE(weak.expired()) << "the thread that hangs keeps no service";
  plain.reset();
  queue.reset();
  files.Revive("dead");
  files.WaitUntilLooking(0);
  threads.reset();
  EXPECT_LE(postal->RunAll(), 1);
  EXPECT_THAT(ended, IsEmpty());
}

TEST_F(FileWaitTest, WhatALookThrowsIsThrownWhereTheCallRuns)
{
  const auto throwing =
      Make("Group.Throwing",
           [](const std::string& file) -> IResult
           {
             (void)NMX::LookAtFile(
                 file, +[](const std::filesystem::path&) -> int { throw std::runtime_error("no memory for it"); });
             return EResult::Failed;
           });
  const LogCapture log;
  Call(1, throwing, "a");
  EXPECT_THAT(Ended(1), ElementsAre("1 a NoResult"));
  EXPECT_THAT(log.messages, ElementsAre("Group.Throwing: no memory for it"));
}

TEST_F(FileWaitTest, CallsEndAsInAModelWhereEachCallerHasAQueue)
{
  // The first three callers ask for files that may be dead, so that one thread always answers.
  constexpr std::uint64_t callers = 5;
  std::mt19937 random(7);
  std::map<std::uint64_t, std::vector<std::string>> asked; // in the model, what a caller waits for, in order
  std::map<std::string, int> dead;
  std::size_t expectedEnds = 0;
  const auto settle = [&]
  {
    std::map<std::uint64_t, std::vector<std::string>> expected;
    for (auto& [caller, names] : asked)
      while (!names.empty() && !dead.contains(names.front()))
      {
        expected[caller].push_back(std::to_string(caller) + ' ' + names.front() + " Ok");
        names.erase(names.begin());
        ++expectedEnds;
      }
    RunUntilEnded(std::exchange(expectedEnds, 0));
    std::map<std::uint64_t, std::vector<std::string>> found;
    for (const std::string& end : std::exchange(ended, {}))
      found[std::stoul(end)].push_back(end);
    EXPECT_EQ(found, expected);
  };
  for (int step = 0; step < 400 && !HasFailure(); ++step)
  {
    const std::uint64_t caller = random() % callers;
    const std::string file = "file" + std::to_string(caller < 3 ? random() % 6 : 6 + caller);
    switch (random() % 8)
    {
    case 0:
      if (dead.empty() || random() % 2 == 0)
      {
        const std::string name = "file" + std::to_string(random() % 6);
        settle(); // what has been asked for before has been looked at, or is looked for
        files.Kill(name);
        dead[name] = 1;
      }
      else
      {
        files.Revive(dead.begin()->first);
        dead.erase(dead.begin());
        settle();
      }
      break;
    case 1:
    case 2:
    case 3:
      Call(caller, read, file);
      asked[caller].push_back(file);
      break;
    default:
      Call(caller, plain, "plain");
      asked[caller].emplace_back("plain");
    }
    if (random() % 4 == 0)
      postal->RunAll();
  }
  for (const auto& [name, unused] : std::exchange(dead, {}))
    files.Revive(name);
  settle();
  for (const auto& [caller, names] : asked)
    EXPECT_THAT(names, IsEmpty()) << caller;
}

TEST(FileThreads, FewRunAndWhatWaitsIsLimited)
{
  NMX::FileThreads threads(1min);
  std::atomic<std::size_t> answered = 0;
  std::atomic<std::size_t> refused = 0;
  const SlowFiles files;
  files.Kill("dead");
  constexpr std::size_t most = NMX::FileThreads::maximumThreads + NMX::FileThreads::maximumWaiting;
  const auto run = [&]
  {
    threads.Run([] { (void)SlowFiles::Text("dead"); },
                [&](NMX::EFileEnd end) { ++(end == NMX::EFileEnd::Answered ? answered : refused); });
  };
  for (std::size_t i = 0; i < NMX::FileThreads::maximumThreads; ++i)
    run();
  files.WaitUntilLooking(NMX::FileThreads::maximumThreads);
  for (std::size_t i = NMX::FileThreads::maximumThreads; i < most; ++i)
    run();
  EXPECT_EQ(refused, 0);
  run();
  EXPECT_EQ(refused, 1);
  EXPECT_EQ(files.Looks("dead"), NMX::FileThreads::maximumThreads);
  files.Revive("dead");
  while (answered != most)
    std::this_thread::sleep_for(1ms);
  EXPECT_EQ(refused, 1);
}
