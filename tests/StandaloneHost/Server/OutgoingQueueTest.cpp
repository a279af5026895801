#include "StandaloneHost/Server/OutgoingQueue.h"

#include <gmock/gmock.h>

using Server::EPolicy;
using testing::ElementsAre;

namespace
{

Server::SharedMessage Message(std::string text)
{
  return std::make_shared<const Server::ResponseText>(std::move(text));
}

std::vector<std::string> Drain(Server::OutgoingQueue& queue)
{
  std::vector<std::string> texts;
  while (!queue.Empty())
  {
    texts.push_back(queue.Front()->Flat());
    queue.Pop();
  }
  return texts;
}

}

TEST(OutgoingQueue, MergesChangesOfOneCallbackAndNothingElse)
{
  const Server::Limits limits;
  Server::OutgoingQueue queue(limits, std::make_shared<Server::OutgoingBytes>(limits));
  const int first = 0, second = 0;
  EXPECT_TRUE(queue.Push(Message("change 1"), EPolicy::Change, &first));
  EXPECT_TRUE(queue.Push(Message("reply"), EPolicy::Reply));
  EXPECT_TRUE(queue.Push(Message("other 1"), EPolicy::Change, &second));
  EXPECT_TRUE(queue.Push(Message("state 1"), EPolicy::Sequence, &first));
  EXPECT_TRUE(queue.Push(Message("state 2"), EPolicy::Sequence, &first));
  EXPECT_TRUE(queue.Push(Message("change number 2"), EPolicy::Change, &first));
  EXPECT_EQ(queue.Bytes(), 15U + 5 + 7 + 7 + 7);
  EXPECT_THAT(Drain(queue), ElementsAre("change number 2", "reply", "other 1", "state 1", "state 2"));
  EXPECT_EQ(queue.Bytes(), 0U);
  EXPECT_TRUE(queue.Push(Message("change 3"), EPolicy::Change, &first));
  EXPECT_THAT(Drain(queue), ElementsAre("change 3")) << "one that was sent is no longer there to merge with";
}

TEST(OutgoingQueue, TellsWhenTheClientIsTooSlow)
{
  Server::Limits limits;
  limits.outgoingBytes = 10;
  limits.outgoingNotifications = 2;
  Server::OutgoingQueue queue(limits, std::make_shared<Server::OutgoingBytes>(limits));
  EXPECT_TRUE(queue.Push(Message("1234567"), EPolicy::Reply));
  EXPECT_FALSE(queue.Push(Message("1234"), EPolicy::Reply));
  EXPECT_TRUE(queue.Push(Message("s"), EPolicy::Sequence));
  EXPECT_TRUE(queue.Push(Message("s"), EPolicy::Sequence));
  EXPECT_FALSE(queue.Push(Message("s"), EPolicy::Sequence));
  EXPECT_TRUE(queue.Push(Message("r"), EPolicy::Reply));
  EXPECT_THAT(Drain(queue), ElementsAre("1234567", "s", "s", "r"));
  EXPECT_TRUE(queue.Push(Message("s"), EPolicy::Sequence));
}

TEST(OutgoingQueue, LeavesEachClientItsShareWhenTooMuchWaitsForAll)
{
  Server::Limits limits;
  limits.outgoingBytes = 80;
  limits.outgoingBytesOverall = 100;
  limits.connections = 10;
  const auto overall = std::make_shared<Server::OutgoingBytes>(limits);
  Server::OutgoingQueue good(limits, overall);
  {
    Server::OutgoingQueue greedy(limits, overall);
    EXPECT_TRUE(greedy.Push(Message(std::string(80, 'x')), EPolicy::Reply));
    EXPECT_TRUE(good.Push(Message(std::string(20, 'x')), EPolicy::Reply));
    EXPECT_FALSE(good.Push(Message("x"), EPolicy::Reply)) << "more than its share, and all is taken";
    EXPECT_EQ(Drain(good).size(), 1U);
    EXPECT_EQ(overall->Total(), 80U);
    const int callback = 0;
    EXPECT_TRUE(greedy.Push(Message(""), EPolicy::Change, &callback));
    EXPECT_TRUE(good.Push(Message(std::string(20, 'x')), EPolicy::Change, &callback));
    EXPECT_FALSE(greedy.Push(Message("x"), EPolicy::Reply));
    EXPECT_EQ(Drain(good).size(), 1U);
    EXPECT_TRUE(good.Push(Message(std::string(10, 'x')), EPolicy::Reply));
    EXPECT_TRUE(good.Push(Message(std::string(10, 'x')), EPolicy::Reply));
    EXPECT_EQ(overall->Total(), 100U);
    EXPECT_EQ(Drain(good).size(), 2U);
  }
  EXPECT_EQ(overall->Total(), 0U) << "what waited for a client that has gone is not counted any more";
  EXPECT_TRUE(good.Push(Message(std::string(80, 'x')), EPolicy::Reply));
}
