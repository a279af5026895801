#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/VSubjectCalibrationServices.h"

#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/MockStore.h"
#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

#include <cstring>
#include <stdexcept>

using NMX::EResult;
using NMX::ESetting;
using NMX::IResult;
using Session = NMX::TCalibrationSessionId;
using Subject = NMX::TSubjectStoreId;
using Service = SubjectCalibrationServices::VSubjectCalibrationServices;
using IService = NMX::ISubjectCalibrationServices;
using EState = IService::ESubjectCalibrationState;
using testing::_;
using testing::ElementsAre;
using testing::InSequence;
using testing::IsEmpty;
using testing::NiceMock;
using testing::Return;
namespace Paths = NMX::Paths;

namespace
{

class MockController : public ISubjectCalibrationController
{
public:
  MOCK_METHOD(IResult, SetTargetSubject, (Subject), (override));
  MOCK_METHOD(IResult, SetTargetSubjects, (const std::set<Subject>&), (override));
  MOCK_METHOD(bool, CanPerform, (ECalibrationAction, std::string&), (const, override));
  MOCK_METHOD(IResult, Perform, (ECalibrationAction, NMX::TCalibrationSessionId&), (override));
  MOCK_METHOD(std::uint32_t, Phase, (), (const, override));
  MOCK_METHOD(NMX::TCalibrationSessionId, Session, (), (const, override));
  MOCK_METHOD(IResult, LastResult, (), (const, override));
  MOCK_METHOD(void, SetFreshCalibration, (bool), (override));
};

class MockCreator : public ISubjectCreator
{
public:
  MOCK_METHOD(IResult, CreateSubject, (NMX::IEntryEditor&, const std::string&, const ISubjectTemplate&), (override));
  MOCK_METHOD(IResult, ReadTemplate,
              (const std::wstring&, const std::wstring&, std::shared_ptr<const ISubjectTemplate>&), (const, override));
};

struct Notifications : ICalibrationNotifications
{
  using MultiCallback = NotificationSystem::VMultiCallbackPostal<void()>;
  std::shared_ptr<Callback> StateChanged() override { return state; }
  std::shared_ptr<Callback> PossibilitiesChanged() override { return possibilities; }
  std::shared_ptr<MultiCallback> state = NMX::MakeShared<MultiCallback>();
  std::shared_ptr<MultiCallback> possibilities = NMX::MakeShared<MultiCallback>();
};

class SubjectCalibrationServicesTest : public StoreFixture
{
protected:
  SubjectCalibrationServicesTest()
  {
    ON_CALL(*controller, CanPerform(_, _)).WillByDefault(Return(true));
    ON_CALL(*controller, LastResult()).WillByDefault(Return(EResult::NotSet));
    Choose(ESetting::CreateSubjectTemplate, L"/t/Short.lbt",
           {{"Short", L"/t/Short.lbt"}, {"T\xC3\xA4ll", L"/t/T\u00e4ll.lbt"}});
    Choose(ESetting::CreateSubjectSkin, L"/s/Adult.skin", {{"Adult", L"/s/Adult.skin"}});
    SetSetting(ESetting::CreateSubjectName, std::string("Zoe"));
    postal->RunAll();
  }

  void SetSetting(ESetting setting, NMX::Value value)
  {
    SetApplication(std::string(NMX::PathOf(setting).Text()), std::move(value));
  }

  void Choose(ESetting setting, std::wstring chosen, std::vector<NMX::Choice> choices)
  {
    SetSetting(setting, NMX::Option{std::move(chosen), std::move(choices)});
  }

  /// What the creator does: the subject and something beneath it.
  void ExpectCreation(IResult result = EResult::Ok)
  {
    EXPECT_CALL(*creator, ReadTemplate(std::wstring(L"/t/Short.lbt"), std::wstring(L"/s/Adult.skin"), _))
        .WillOnce(
            [this](const std::wstring&, const std::wstring&, std::shared_ptr<const ISubjectTemplate>& read)
            {
              EXPECT_NE(store->Editor(), nullptr) << "an edit can begin, as none is open";
              read = content;
              return IResult(EResult::Ok);
            });
    EXPECT_CALL(*creator, CreateSubject(_, "Zoe", testing::Ref(*content)))
        .WillOnce(
            [this, result](NMX::IEntryEditor& editor, const std::string& name, const ISubjectTemplate&)
            {
              EXPECT_TRUE(editor.Add(NMX::ESubjectKind::GeneralSubjects, name, zoe).Succeeded());
              EXPECT_TRUE(editor.Add(NMX::ESubjectKind::Props, name + " hat", hat).Succeeded());
              EXPECT_TRUE(editor.SetValue(hat, Paths::ParentSubjectId(), zoe).Succeeded());
              return result;
            });
  }

  bool Exists(const char* name) const
  {
    Subject id;
    return store->Reader()->FindByName(name, id).Succeeded();
  }

  std::string NewName() const
  {
    std::string name;
    EXPECT_TRUE(service->NewSubjectName(name).Succeeded());
    return name;
  }

  std::shared_ptr<NiceMock<MockController>> controller = std::make_shared<NiceMock<MockController>>();
  std::shared_ptr<MockCreator> creator = std::make_shared<MockCreator>();
  const std::shared_ptr<const ISubjectTemplate> content = std::make_shared<const ISubjectTemplate>();
  Notifications notifications;
  std::shared_ptr<ManualPostal> postal = std::make_shared<ManualPostal>();
  std::shared_ptr<Service> service = Service::Make(store, controller, creator, notifications, postal);
  Subject zoe, hat;
};

/// A session that the controller hands out.
auto StartsSession(unsigned number)
{
  return [number](ECalibrationAction, Session& session)
  {
    session = Session(number);
    return IResult(EResult::Ok);
  };
}

}

TEST_F(SubjectCalibrationServicesTest, AFreshStartMakesTheSubjectAndThenAsksTheController)
{
  ExpectCreation();
  {
    const InSequence order;
    EXPECT_CALL(*controller, SetTargetSubject(_))
        .WillOnce(
            [&](Subject target)
            {
              EXPECT_EQ(target, zoe);
              EXPECT_TRUE(store->Editor()->Commit().Succeeded()) << "the store is free";
              return IResult(EResult::Ok);
            });
    EXPECT_CALL(*controller, SetTargetSubjects(_))
        .WillOnce(
            [&](const std::set<Subject>& targets)
            {
              EXPECT_THAT(targets, ElementsAre(zoe, hat));
              return IResult(EResult::Ok);
            });
    EXPECT_CALL(*controller, CanPerform(ECalibrationAction::StartCalibration, _)).WillOnce(Return(true));
    EXPECT_CALL(*controller, SetFreshCalibration(true));
    EXPECT_CALL(*controller, Perform(ECalibrationAction::StartCalibration, _)).WillOnce(StartsSession(7));
  }
  Session session;
  EXPECT_EQ(service->StartSubjectCalibration(session, "take 1"), IResult(EResult::Ok));
  EXPECT_EQ(session, Session(7));
  EState state{};
  EXPECT_TRUE(service->LatestSubjectCalibrationState(session, state).Succeeded());
  EXPECT_EQ(session, Session(7));
}

TEST_F(SubjectCalibrationServicesTest, AFreshStartThatIsRefusedLeavesTheSubjectOnlyOnceItWasMade)
{
  Session session(99);
  for (const char* name : {"a/b", "a:b", "a*b", "a?b", "a\"b", "<", ">", "|", "a.b", ",", ";", "\\"})
    EXPECT_EQ(service->StartSubjectCalibration(session, name), IResult(EResult::InvalidArgument)) << name;
  EXPECT_EQ(service->StartSubjectCalibration(session, std::string(1 << 20, 'x') + '.'),
            IResult(EResult::InvalidArgument));
  ExpectCreation(EResult::FileIOFailure);
  EXPECT_EQ(service->StartSubjectCalibration(session, ""), IResult(EResult::FileIOFailure));
  EXPECT_FALSE(Exists("Zoe"));

  EXPECT_CALL(*controller, SetFreshCalibration(_)).Times(0);
  EXPECT_CALL(*controller, Perform(_, _)).Times(0);
  EXPECT_CALL(*controller, CanPerform(ECalibrationAction::StartCalibration, _)).WillOnce(Return(false));
  ExpectCreation();
  EXPECT_EQ(service->StartSubjectCalibration(session, ""), IResult(EResult::NotAvailable));
  EXPECT_TRUE(Exists("Zoe"));
  EState state{};
  EXPECT_EQ(session, Session(99));
  EXPECT_TRUE(service->LatestSubjectCalibrationState(session, state).Succeeded());
  EXPECT_FALSE(session.Valid()) << "none was started";
}

TEST_F(SubjectCalibrationServicesTest, ARecalibrationAsksFirstAndIsNeverFresh)
{
  EXPECT_CALL(*controller, SetFreshCalibration(_)).Times(0);
  EXPECT_CALL(*controller, CanPerform(ECalibrationAction::StartRecalibration, _))
      .WillOnce(Return(false))
      .WillRepeatedly(Return(true));
  Session session;
  EXPECT_EQ(service->StartSubjectRecalibration(session, "a.b"), IResult(EResult::NotAvailable));
  EXPECT_EQ(service->StartSubjectRecalibration(session, "a.b"), IResult(EResult::InvalidArgument));
  EXPECT_CALL(*controller, Perform(ECalibrationAction::StartRecalibration, _))
      .WillOnce(StartsSession(3))
      .WillOnce(
          [](ECalibrationAction, Session& given)
          {
            given = Session(4);
            return IResult(EResult::TimedOut);
          });
  EXPECT_EQ(service->StartSubjectRecalibration(session, "take 2"), IResult(EResult::Ok));
  EXPECT_EQ(session, Session(3));
  EXPECT_EQ(service->StartSubjectRecalibration(session, ""), IResult(EResult::TimedOut));
  EXPECT_EQ(session, Session(3)) << "a start that failed gives no session";
  EState state{};
  EXPECT_TRUE(service->LatestSubjectCalibrationState(session, state).Succeeded());
  EXPECT_EQ(session, Session(3));
}

TEST_F(SubjectCalibrationServicesTest, TheRunsActionsAreTheControllersIfTheyArePossible)
{
  const struct
  {
    ECalibrationAction action;
    IResult (IService::*operation)(Session);
  } rows[] = {{ECalibrationAction::AcceptTPose, &IService::AcceptTPose},
              {ECalibrationAction::Stop, &IService::StopSubjectCalibration},
              {ECalibrationAction::Cancel, &IService::CancelSubjectCalibration}};
  for (const auto& [action, operation] : rows)
  {
    EXPECT_CALL(*controller, CanPerform(action, _)).WillOnce(Return(false)).WillOnce(Return(true));
    EXPECT_CALL(*controller, Perform(action, testing::Eq(Session(12)))).WillOnce(Return(EResult::InvalidSession));
    EXPECT_EQ((*service.*operation)(Session(12)), IResult(EResult::NotAvailable));
    EXPECT_EQ((*service.*operation)(Session(12)), IResult(EResult::InvalidSession));
  }
}

TEST_F(SubjectCalibrationServicesTest, EveryPhaseAndLastResultIsOneOfFiveStates)
{
  std::vector<std::pair<Session, EState>> told;
  const auto subscription = service->LatestSubjectCalibrationStateChangedCallback()->Subscribe(
      postal, [&](Session session, EState state) { told.emplace_back(session, state); });
  const struct
  {
    std::uint32_t phase;
    IResult last;
    EState state;
  } rows[] = {{0, EResult::NotSet, EState::None},           {0, EResult::Canceled, EState::Cancelled},
              {0, EResult::Ok, EState::Completed},          {0, EResult::Failed, EState::Completed},
              {0, EResult::TimedOut, EState::Completed},    {1, EResult::Ok, EState::TPoseLabelling},
              {1, EResult::NotSet, EState::TPoseLabelling}, {2, EResult::Canceled, EState::Calibrating},
              {3, EResult::NotSet, EState::Calibrating},    {4, EResult::Ok, EState::Completed},
              {7, EResult::NotSet, EState::None},           {~0U, EResult::Canceled, EState::Cancelled}};
  for (const auto& [phase, last, expected] : rows)
  {
    EXPECT_CALL(*controller, Phase()).WillRepeatedly(Return(phase));
    EXPECT_CALL(*controller, LastResult()).WillRepeatedly(Return(last));
    Session session(5);
    EState state{};
    EXPECT_TRUE(service->LatestSubjectCalibrationState(session, state).Succeeded());
    EXPECT_EQ(state, expected) << phase << ' ' << last.Name();
    told.clear();
    notifications.state->Fire();
    notifications.state->Fire();
    postal->RunAll();
    EXPECT_THAT(told, ElementsAre(std::pair(Session(0), expected), std::pair(Session(0), expected)));
  }
}

TEST_F(SubjectCalibrationServicesTest, OnlyWhatIsPossibleNowAndWasNotOrTheReverseIsTold)
{
  std::vector<std::string> told;
  std::vector<NMX::Subscription> subscriptions;
  const auto listen = [&](const char* name, const std::shared_ptr<IService::CanChangedCallback>& callback)
  {
    subscriptions.push_back(callback->Subscribe(postal, [&told, name](bool able)
                                                { told.push_back(std::string(name) + (able ? "+" : "-")); }));
  };
  listen("start", service->CanStartSubjectCalibrationChangedCallback());
  listen("again", service->CanStartSubjectRecalibrationChangedCallback());
  listen("accept", service->CanAcceptTPoseChangedCallback());
  listen("stop", service->CanStopSubjectCalibrationChangedCallback());
  listen("cancel", service->CanCancelSubjectCalibrationChangedCallback());
  const auto refresh = [&]
  {
    told.clear();
    notifications.possibilities->Fire();
    postal->RunAll();
    return told;
  };
  std::set<ECalibrationAction> impossible;
  EXPECT_CALL(*controller, CanPerform(_, _))
      .WillRepeatedly(
          [&](ECalibrationAction action, std::string& reason)
          {
            reason = "Not now.";
            return !impossible.contains(action);
          });
  EXPECT_THAT(refresh(), ElementsAre("start+", "again+", "accept+", "stop+", "cancel+"));
  EXPECT_THAT(refresh(), IsEmpty());
  impossible = {ECalibrationAction::Cancel};
  EXPECT_THAT(refresh(), ElementsAre("cancel-"));
  impossible = {ECalibrationAction::Stop, ECalibrationAction::StartRecalibration, ECalibrationAction::StartCalibration};
  SetSetting(ESetting::CreateSubjectAction, NMX::Action{});
  SetSetting(ESetting::CreateSubjectName, std::string());
  EXPECT_THAT(refresh(), ElementsAre("start-", "again-", "stop-", "cancel+"));

  std::string reason;
  EXPECT_FALSE(service->CanStopSubjectCalibration(reason));
  EXPECT_EQ(reason, "Not now.");
  const LogCapture log;
  EXPECT_CALL(*controller, CanPerform(_, _)).WillRepeatedly(testing::Throw(std::runtime_error("out of order")));
  EXPECT_FALSE(service->CanAcceptTPose(reason));
}

TEST(SubjectCalibrationServices, WhetherAFreshStartIsPossibleIsABitOfTheStoresAction)
{
  const auto store = std::make_shared<MockStore>();
  const auto service = NMX::MakeShared<Service>(store, nullptr, nullptr);
  for (const auto& [value, possible] : {std::pair(NMX::Value(NMX::Action{2, "No studio."}), false),
                                        {NMX::Action{7, "No studio."}, false},
                                        {NMX::Action{0, "No studio."}, true},
                                        {NMX::Action{0xFFFFFFFD, "No studio."}, true},
                                        {std::string("No studio."), true},
                                        {NMX::Value{}, true}})
  {
    EXPECT_CALL(*store, Reader())
        .WillOnce(
            [&action = value]
            {
              auto reader = std::make_unique<NiceMock<MockEditor>>();
              EXPECT_CALL(*reader,
                          FindApplicationEntry(NMX::EntryPath("Application/Settings/SubjectStore/CreateSubjectAction")))
                  .WillOnce(Return(&action));
              return reader;
            });
    std::string reason = "old";
    EXPECT_EQ(service->CanStartSubjectCalibration(reason), possible);
    EXPECT_EQ(reason, possible ? "" : "No studio.");
  }
}

TEST_F(SubjectCalibrationServicesTest, ANameOfASubjectMakesItTheTarget)
{
  const Id body = Add(NMX::ESubjectKind::GeneralSubjects, "Body");
  const Id arm = Add(NMX::ESubjectKind::Props, "Arm");
  Set(arm, Paths::ParentSubjectId(), body);
  EXPECT_CALL(*controller, SetTargetSubject(body))
      .Times(3)
      .WillOnce(Return(EResult::NotAvailable))
      .WillRepeatedly(Return(EResult::Ok));
  EXPECT_CALL(*controller, SetTargetSubjects(std::set<Subject>{body, arm}))
      .WillOnce(Return(EResult::Failed))
      .WillOnce(Return(EResult::Ok));
  EXPECT_EQ(service->SetNewSubjectName("Body"), IResult(EResult::NotAvailable));
  EXPECT_EQ(service->SetNewSubjectName("Body"), IResult(EResult::Failed));
  EXPECT_EQ(NewName(), "Zoe") << "nothing is written then";
  EXPECT_EQ(service->SetNewSubjectName("Body"), IResult(EResult::Ok));
  EXPECT_EQ(NewName(), "Body");
  EXPECT_EQ(service->SetNewSubjectName("Nobody yet"), IResult(EResult::Ok));
  EXPECT_EQ(NewName(), "Nobody yet");

  for (const std::string& name : {std::string(), std::string(" x"), std::string("a/b"), std::string("x\n"),
                                  std::string(256, 'x'), std::string(1 << 20, 'x')})
    EXPECT_EQ(service->SetNewSubjectName(name), IResult(EResult::InvalidArgument)) << name.substr(0, 9);
  EXPECT_EQ(service->SetNewSubjectName(std::string(255, 'x')), IResult(EResult::Ok));
  EXPECT_EQ(service->SetNewSubjectName("Nobody yet"), IResult(EResult::Ok));
  const LogCapture log;
  for (const char* pattern : {"[", "(a+)+$", "Z.."})
  {
    SetSetting(ESetting::NameRegex, std::string(pattern));
    EXPECT_EQ(service->SetNewSubjectName(std::string(200, 'a') + '!'), IResult(EResult::InvalidArgument)) << pattern;
  }
  EXPECT_EQ(service->SetNewSubjectName("Zia"), IResult(EResult::Ok));
  EXPECT_EQ(service->SetNewSubjectName("Zia "), IResult(EResult::InvalidArgument)) << "it matches in part only";
  EXPECT_EQ(NewName(), "Zia");
  SetSetting(ESetting::CreateSubjectName, {});
  std::string name = "untouched";
  EXPECT_EQ(service->NewSubjectName(name), IResult(EResult::Failed));
  EXPECT_EQ(name, "untouched");
}

TEST_F(SubjectCalibrationServicesTest, TemplatesAndSkinsAreChosenByTheirNames)
{
  std::vector<std::string> names;
  std::string name;
  std::string path;
  EXPECT_TRUE(service->SubjectLabellingTemplates(names).Succeeded());
  EXPECT_THAT(names, ElementsAre("Short", "T\xC3\xA4ll"));
  int changes = 0;
  const auto subscription = service->SubjectCalibrationSettingsChangedCallback()->Subscribe(postal, [&] { ++changes; });
  EXPECT_TRUE(service->SetSubjectLabellingTemplate("T\xC3\xA4ll").Succeeded());
  EXPECT_EQ(service->SetSubjectLabellingTemplate("short"), IResult(EResult::Failed));
  EXPECT_EQ(service->SetSubjectSkin("Short"), IResult(EResult::Failed));
  postal->RunAll();
  EXPECT_EQ(changes, 1);
  EXPECT_TRUE(service->SubjectLabellingTemplate(name, path).Succeeded());
  EXPECT_EQ(name + path, "T\xC3\xA4ll/t/T\xC3\xA4ll.lbt");
  EXPECT_TRUE(service->SubjectSkin(name, path).Succeeded());
  EXPECT_EQ(name + path, "Adult/s/Adult.skin");

  Choose(ESetting::CreateSubjectSkin, L"/s/Gone.skin", {{"Adult", L"/s/Adult.skin"}});
  EXPECT_EQ(service->SubjectSkin(name, path), IResult(EResult::Failed));
  SetSetting(ESetting::CreateSubjectSkin, {});
  EXPECT_EQ(service->SubjectSkin(name, path), IResult(EResult::Failed));
  EXPECT_EQ(service->SetSubjectSkin("Adult"), IResult(EResult::Failed));
  EXPECT_TRUE(service->SubjectSkins(names).Succeeded());
  EXPECT_THAT(names, IsEmpty());
}

TEST_F(SubjectCalibrationServicesTest, NotificationsEndWithTheStrandAndWithTheService)
{
  int told = 0;
  const auto listener = std::make_shared<ManualPostal>();
  const auto subscription =
      service->LatestSubjectCalibrationStateChangedCallback()->Subscribe(listener, [&](Session, EState) { ++told; });
  notifications.state->Fire();
  service.reset();
  postal->RunAll();
  notifications.state->Fire();
  EXPECT_EQ(postal->RunAll(), 0) << "nobody subscribes any more";
  service = Service::Make(store, controller, creator, notifications, postal);
  postal.reset();
  notifications.state->Fire();
  notifications.possibilities->Fire();
  listener->RunAll();
  EXPECT_EQ(told, 0);
}

/// Hosts call the interface through its table: the order of its operations is part of it.
TEST(SubjectCalibrationInterface, ItsOperationsStandInTheirOrder)
{
  const auto slot = [](auto operation)
  {
    std::ptrdiff_t offset = 0;
    std::memcpy(&offset, &operation, sizeof(offset));
    return static_cast<int>((offset - 1) / static_cast<std::ptrdiff_t>(sizeof(void*))) - 2; // after two destructors
  };
  const int slots[] = {slot(&IService::CanStartSubjectCalibration),
                       slot(&IService::CanStartSubjectRecalibration),
                       slot(&IService::CanAcceptTPose),
                       slot(&IService::CanStopSubjectCalibration),
                       slot(&IService::CanCancelSubjectCalibration),
                       slot(&IService::CanStartSubjectCalibrationChangedCallback),
                       slot(&IService::CanStartSubjectRecalibrationChangedCallback),
                       slot(&IService::CanAcceptTPoseChangedCallback),
                       slot(&IService::CanStopSubjectCalibrationChangedCallback),
                       slot(&IService::CanCancelSubjectCalibrationChangedCallback),
                       slot(&IService::StartSubjectCalibration),
                       slot(&IService::StartSubjectRecalibration),
                       slot(&IService::AcceptTPose),
                       slot(&IService::CancelSubjectCalibration),
                       slot(&IService::StopSubjectCalibration),
                       slot(&IService::LatestSubjectCalibrationState),
                       slot(&IService::LatestSubjectCalibrationStateChangedCallback),
                       slot(&IService::SetNewSubjectName),
                       slot(&IService::NewSubjectName),
                       slot(&IService::SubjectLabellingTemplates),
                       slot(&IService::SetSubjectLabellingTemplate),
                       slot(&IService::SubjectLabellingTemplate),
                       slot(&IService::SubjectSkins),
                       slot(&IService::SetSubjectSkin),
                       slot(&IService::SubjectSkin),
                       slot(&IService::SubjectCalibrationSettingsChangedCallback)};
  for (int i = 0; i < 26; ++i)
    EXPECT_EQ(slots[i], i);
}
