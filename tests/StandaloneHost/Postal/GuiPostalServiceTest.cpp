#include "StandaloneHost/Postal/VGuiPostalService.h"
#include "tests/Support/Eventually.h"
#include "tests/Support/LogCapture.h"

#include <QCoreApplication>

#include <gmock/gmock.h>

#include <algorithm>
#include <memory>
#include <stdexcept>
#include <thread>

using testing::ElementsAre;
using testing::IsEmpty;

namespace
{

class GuiPostalService : public testing::Test
{
protected:
  void PostNumber(int number)
  {
    postal->Post([this, number] { ran.push_back(number); });
  }

  static void RunEventLoop() { QCoreApplication::processEvents(); }

  int argumentCount = 0;
  QCoreApplication application{argumentCount, nullptr};
  std::unique_ptr<Postal::VGuiPostalService> postal = std::make_unique<Postal::VGuiPostalService>();
  std::vector<int> ran;
};

}

TEST_F(GuiPostalService, RunsTasksInTheirOrderAndNeverInsidePost)
{
  PostNumber(1);
  postal->Post(
      [this]
      {
        PostNumber(3);
        ran.push_back(2);
      });
  EXPECT_THAT(ran, IsEmpty());
  RunEventLoop();
  RunEventLoop();
  EXPECT_THAT(ran, ElementsAre(1, 2, 3));
}

TEST_F(GuiPostalService, GivesTheEventLoopItsTurnBetweenTasksThatPostEachOther)
{
  int turns = 0;
  std::function<void()> again = [&]
  {
    ++turns;
    postal->Post(again);
  };
  postal->Post(again);
  bool reached = false;
  QMetaObject::invokeMethod(&application, [&] { reached = true; }, Qt::QueuedConnection);
  for (int i = 0; i < 10 && !reached; ++i)
    QCoreApplication::sendPostedEvents();
  EXPECT_TRUE(reached);
  EXPECT_LE(turns, 10);
  postal->Stop();
}

TEST_F(GuiPostalService, RunsTasksOfOtherThreadsOnItsOwn)
{
  constexpr int threads = 4;
  constexpr int each = 1000;
  std::vector<std::vector<int>> numbers(threads);
  int foreign = 0;
  int count = 0;
  std::vector<std::jthread> posters;
  for (int thread = 0; thread < threads; ++thread)
    posters.emplace_back(
        [&, thread]
        {
          for (int i = 0; i < each; ++i)
            postal->Post(
                [&, thread, i, poster = std::this_thread::get_id()]
                {
                  foreign += std::this_thread::get_id() == poster ? 1 : 0;
                  numbers[static_cast<std::size_t>(thread)].push_back(i);
                  ++count;
                });
        });
  EXPECT_TRUE(Eventually([&] { return count >= threads * each; }, RunEventLoop));
  EXPECT_EQ(foreign, 0);
  for (const auto& ofThread : numbers)
    EXPECT_TRUE(ofThread.size() == each && std::is_sorted(ofThread.begin(), ofThread.end()));
}

TEST_F(GuiPostalService, DropsEverythingOnceStopped)
{
  const auto held = std::make_shared<int>(0);
  PostNumber(1);
  postal->Post([held] {});
  postal->Stop();
  EXPECT_EQ(held.use_count(), 1);
  PostNumber(2);
  RunEventLoop();
  EXPECT_THAT(ran, IsEmpty());
}

TEST_F(GuiPostalService, MayGoWhileTasksWait)
{
  PostNumber(1);
  postal.reset();
  RunEventLoop();
  EXPECT_THAT(ran, IsEmpty());
}

TEST_F(GuiPostalService, GoesOnAfterATaskThatFails)
{
  LogCapture log;
  postal->Post([] { throw std::runtime_error("no such thing"); });
  PostNumber(1);
  RunEventLoop();
  EXPECT_THAT(ran, ElementsAre(1));
  EXPECT_THAT(log.messages, ElementsAre(testing::HasSubstr("no such thing")));
}
