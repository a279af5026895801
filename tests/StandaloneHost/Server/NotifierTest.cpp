#include "StandaloneHost/Server/Notifier.h"

#include "HostInterface/NotificationSystem/VMultiCallbackPostal.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VServerCallback.h"
#include "tests/Support/ManualPostal.h"

#include <gmock/gmock.h>

#include <vector>

using namespace Server;
using NMX::EResult;
using NMX::IResult;
using testing::ElementsAre;

namespace
{

constexpr TerminalServer2::ArgumentText able[] = {{"Able", ""}};

struct Listener final : IListener
{
  void Notify(const SharedMessage& message, EPolicy policy, const void*) override
  {
    messages.push_back(message);
    texts.push_back((policy == EPolicy::Change ? "change " : "sequence ") + message->Own());
    if (leave)
      leave();
  }
  std::vector<SharedMessage> messages;
  std::vector<std::string> texts;
  std::function<void()> leave;
};

class NotifierTest : public testing::Test
{
protected:
  template <class Signature>
  std::shared_ptr<NotificationSystem::VMultiCallbackPostal<Signature>>
  Add(TerminalServer2::Level level, const char* name, std::span<const TerminalServer2::ArgumentText> texts)
  {
    auto multiCallback = NMX::MakeShared<NotificationSystem::VMultiCallbackPostal<Signature>>();
    using Callback = TerminalServer2::VServerCallback<Signature, NMX::IMultiCallbackPostal<Signature>>;
    EXPECT_TRUE(registry
                    .Add(level, NMX::MakeShared<Callback>(TerminalServer2::FunctionRecord{name, "", texts, ""},
                                                          multiCallback, postal))
                    .Succeeded());
    return multiCallback;
  }

  Limits limits;
  std::shared_ptr<ManualPostal> postal = std::make_shared<ManualPostal>();
  Registry registry;
  std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void()>> changed = Add<void()>(2, "A.ChangedCallback", {});
  std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void(bool)>> ableChanged =
      Add<void(bool)>(2, "A.AbleCallback", able);
  std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void()>> preview = Add<void()>(1, "AB.Preview", {});
  Notifier notifier{registry, limits};
  Listener first;
  Listener second;
};

}

TEST_F(NotifierTest, WritesANotificationOnceForAllWhoListen)
{
  EXPECT_EQ(notifier.Subscribe("A.*", first, 2), IResult(EResult::Ok));
  EXPECT_EQ(notifier.Subscribe("A.AbleCallback", second, 2), IResult(EResult::Ok));
  changed->Fire();
  ableChanged->Fire(true);
  preview->Fire();
  postal->RunAll();
  EXPECT_THAT(
      first.texts,
      ElementsAre(R"(change {"jsonrpc":"2.0","method":"A.ChangedCallback","params":{"sequence":1}})",
                  R"(sequence {"jsonrpc":"2.0","method":"A.AbleCallback","params":{"Able":true,"sequence":2}})"));
  ASSERT_EQ(second.messages.size(), 1U);
  EXPECT_EQ(second.messages[0], first.messages[1]) << "one text, shared";
  EXPECT_EQ(notifier.Sequence(), 2U);
}

TEST_F(NotifierTest, RefusesWhatCannotBeSubscribedToAndNoticesWhatIsNotNew)
{
  EXPECT_EQ(notifier.Subscribe("A", first, 2), IResult(EResult::NotFound));
  EXPECT_EQ(notifier.Subscribe("", first, 2), IResult(EResult::NotFound));
  EXPECT_EQ(notifier.Subscribe("B.*", first, 2), IResult(EResult::NotFound));
  EXPECT_EQ(notifier.Subscribe("AB.Preview", first, 2), IResult(EResult::NotPermitted));
  EXPECT_EQ(notifier.Subscribe("AB.Preview", first, 1), IResult(EResult::Ok));
  EXPECT_EQ(notifier.Subscribe("A.ChangedCallback", first, 2), IResult(EResult::Ok));
  EXPECT_EQ(notifier.Subscribe("A.*", first, 2), IResult(EResult::Ok)) << "one of the two is new";
  EXPECT_EQ(notifier.Subscribe("A.*", first, 2), IResult(EResult::OkButNoEffect));
  EXPECT_EQ(notifier.Unsubscribe("A.*", first), IResult(EResult::Ok));
  EXPECT_EQ(notifier.Unsubscribe("A.*", first), IResult(EResult::OkButNoEffect));
  EXPECT_EQ(notifier.Unsubscribe("C.*", first), IResult(EResult::NotFound));

  limits.subscriptions = 2;
  EXPECT_EQ(notifier.Subscribe("A.*", first, 2), IResult(EResult::AllocationFailure)) << "with the one it still has";
  EXPECT_EQ(notifier.Subscribe("A.*", second, 2), IResult(EResult::Ok)) << "the limit is that of one connection";
}

TEST_F(NotifierTest, AListenerMayLeaveWhileItIsTold)
{
  first.leave = [this] { notifier.Forget(first); };
  EXPECT_TRUE(notifier.Subscribe("A.*", first, 2).Succeeded());
  changed->Fire();
  changed->Fire();
  ableChanged->Fire(false);
  postal->RunAll();
  EXPECT_EQ(first.texts.size(), 1U);
  EXPECT_TRUE(notifier.Subscribe("A.*", second, 2).Succeeded());
  changed->Fire();
  postal->RunAll();
  EXPECT_EQ(second.texts.size(), 1U);
}
