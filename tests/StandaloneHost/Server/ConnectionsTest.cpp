#include "StandaloneHost/Server/Connections.h"

#include <gtest/gtest.h>

#include <deque>

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

/// A connection that only has an age.
struct Aged final : Server::IConnection, std::enable_shared_from_this<Aged>
{
  void Close() override {}
  void Abort() override {}
  void Tick(Clock::time_point /*now*/) override {}
  [[nodiscard]] std::optional<Clock::time_point> WaitsSince() const override { return waits; }
  [[nodiscard]] std::optional<Clock::time_point> StrangerSince() const override { return stranger; }
  std::weak_ptr<IConnection> Weak() override { return weak_from_this(); }

  std::optional<Clock::time_point> waits;
  std::optional<Clock::time_point> stranger;
};

}

TEST(Connections, StrangersMakeRoomFirstButForASmallShare)
{
  using std::chrono::milliseconds;
  const auto now = Server::IConnection::Clock::now();
  Server::Connections connections(32); // two of them are left to strangers
  std::deque<Aged> all;
  const auto add = [&](std::optional<int> waits, std::optional<int> stranger) -> Aged&
  {
    Aged& aged = all.emplace_back();
    if (waits)
      aged.waits = now - milliseconds(*waits);
    if (stranger)
      aged.stranger = now - milliseconds(*stranger);
    connections.Add(aged);
    return aged;
  };
  EXPECT_EQ(connections.FirstToEnd(now), nullptr);
  add({}, {}); // a WebSocket
  add(900, {});
  EXPECT_EQ(connections.FirstToEnd(now), nullptr) << "who calls has a second";
  Aged& young = add(5, 5);
  EXPECT_EQ(connections.FirstToEnd(now), &young);
  Aged& idle = add(1100, {});
  EXPECT_EQ(connections.FirstToEnd(now), &idle) << "a newcomer is to live until it has shown who it is";
  Aged& old = add(1, 700);
  EXPECT_EQ(connections.FirstToEnd(now), &old) << "a stranger that keeps talking is not idle, but first";
  connections.Remove(old);
  EXPECT_EQ(connections.FirstToEnd(now), &idle);
  EXPECT_EQ(connections.Count(), 4U);
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
