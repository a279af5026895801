#include "HostInterface/NotificationSystem/VAsioPostalServiceStrand.h"
#include "HostInterface/NotificationSystem/VMultiCallbackPostal.h"
#include "StandaloneHost/Postal/VAsioPostalService.h"
#include "tests/Support/ManualPostal.h"

#include <gmock/gmock.h>

#include <boost/asio/io_context.hpp>

#include <atomic>
#include <thread>
#include <vector>

using testing::ElementsAre;

TEST(Strand, RunsTasksOneAtATimeAndInOrderOnAContextWithManyThreads)
{
  struct SharedContext : NMX::IAsioPostalService
  {
    void Post(std::function<void()>) override {}
    boost::asio::io_context& Context() override { return context; }
    boost::asio::io_context context;
  };
  const auto postal = std::make_shared<SharedContext>();
  const auto strand = NMX::MakeShared<NotificationSystem::VAsioPostalServiceStrand>(postal);

  std::vector<int> order;
  std::atomic<int> running = 0;
  std::atomic<bool> overlapped = false;
  for (int i = 0; i < 1000; ++i)
    strand->Post(
        [&, i]
        {
          overlapped = overlapped || ++running != 1;
          order.push_back(i);
          --running;
        });
  std::vector<std::thread> threads;
  for (int i = 0; i < 4; ++i)
    threads.emplace_back([&] { postal->context.run(); });
  for (auto& thread : threads)
    thread.join();

  EXPECT_FALSE(overlapped);
  ASSERT_EQ(order.size(), 1000U);
  EXPECT_TRUE(std::is_sorted(order.begin(), order.end()));
}

TEST(MultiCallback, ReachesEverySubscriberLaterAndNoneThatHasLeft)
{
  const auto postal = std::make_shared<ManualPostal>();
  const auto callback = NMX::MakeShared<NotificationSystem::VMultiCallbackPostal<void(int)>>();
  std::vector<int> first;
  std::vector<int> second;
  auto firstSubscription = callback->Subscribe(postal, [&](int value) { first.push_back(value); });
  const auto secondSubscription = callback->Subscribe(postal, [&](int value) { second.push_back(value); });

  callback->Fire(1);
  EXPECT_TRUE(first.empty()) << "a handler ran inside Fire";
  postal->RunAll();
  callback->Fire(2);
  firstSubscription.reset(); // after the notification was raised, before it is delivered
  postal->RunAll();
  EXPECT_THAT(first, ElementsAre(1));
  EXPECT_THAT(second, ElementsAre(1, 2));
}

TEST(MultiCallback, DropsNotificationsWhoseStrandIsGone)
{
  auto postal = std::make_shared<ManualPostal>();
  const auto callback = NMX::MakeShared<NotificationSystem::VMultiCallbackPostal<void()>>();
  const auto subscription = callback->Subscribe(postal, [] { FAIL(); });
  postal.reset();
  callback->Fire();
}

TEST(PostalService, RunsWhatWasPostedBeforeItStopsAndSurvivesATaskThatThrows)
{
  const auto postal = NMX::MakeShared<Postal::VAsioPostalService>();
  std::atomic<int> ran = 0;
  postal->Post([] { throw 1; });
  for (int i = 0; i < 100; ++i)
    postal->Post([&] { ++ran; });
  postal->Stop();
  EXPECT_EQ(ran, 100);
}
