#include "StandaloneHost/Server/Core.h"

#include <gtest/gtest.h>

namespace
{

/// Tries to begin a call, again whenever it may read on.
struct Caller final : Server::IConnection, std::enable_shared_from_this<Caller>
{
  explicit Caller(Server::CallsInFlight& shared) : calls(shared) {}
  void Close() override {}
  void Abort() override {}
  void Tick(std::chrono::steady_clock::time_point /*now*/) override {}
  std::weak_ptr<IConnection> Weak() override { return weak_from_this(); }
  void ReadOn() override { Read(); }
  void Read()
  {
    if (calls.MayBegin(shared_from_this()))
    {
      ++begun;
      calls.Count(1);
    }
  }

  Server::CallsInFlight& calls;
  int begun = 0;
};

}

TEST(CallsInFlight, WhoFindsNoRoomIsKeptAndReadsOnInTurn)
{
  Server::CallsInFlight calls(2);
  const auto first = std::make_shared<Caller>(calls);
  first->Read();
  first->Read();
  const auto second = std::make_shared<Caller>(calls);
  second->Read();
  const std::weak_ptr<Caller> third = [&]
  {
    const auto caller = std::make_shared<Caller>(calls);
    caller->Read();
    return caller;
  }();
  ASSERT_FALSE(third.expired()) << "it has nothing else that keeps it";
  EXPECT_EQ(second->begun + third.lock()->begun, 0);
  calls.Count(-1);
  EXPECT_EQ(second->begun, 1);
  EXPECT_EQ(third.lock()->begun, 0);
  calls.Count(-2);
  EXPECT_TRUE(third.expired()) << "it has read on and goes its own way";
  second->Read();
  EXPECT_EQ(second->begun, 2) << "one of two places is free";
}
