#include "StandaloneHost/Calibration/VCalibrationProvider.h"
#include "StandaloneHost/Store/CreateActions.h"
#include "StoreInterface/SettingsPaths.h"
#include "StoreInterface/WideText.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualAsioPostal.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <fstream>

using Calibration::VSubjectCalibrationController;
using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using Session = NMX::TCalibrationSessionId;
using testing::ElementsAre;
using testing::HasSubstr;
using namespace std::chrono_literals;
namespace Paths = NMX::Paths;
using enum ECalibrationAction;

namespace
{

class CalibrationControllerTest : public StoreFixture
{
protected:
  std::shared_ptr<VSubjectCalibrationController> Make(Calibration::CalibrationTimes times)
  {
    auto made = std::make_shared<VSubjectCalibrationController>(store, timers, notifications, times);
    made->Open(postal);
    return made;
  }

  IResult Perform(ECalibrationAction action, unsigned session = 0)
  {
    Session id(session);
    const IResult performed = controller->Perform(action, id);
    latest = id;
    return performed;
  }

  std::string Reason(ECalibrationAction action) const
  {
    std::string reason;
    const bool possible = controller->CanPerform(action, reason);
    EXPECT_EQ(possible, reason.empty());
    return reason;
  }

  std::int32_t Shown(Id id) const { return Get<std::int32_t>(id, Paths::Calibration()); }
  bool ShownRunning() const { return store->Reader()->FindApplicationEntry(Store::CalibrationRunning()) != nullptr; }

  std::shared_ptr<ManualPostal> postal = std::make_shared<ManualPostal>();
  std::shared_ptr<ManualAsioPostal> timers = std::make_shared<ManualAsioPostal>();
  std::shared_ptr<Calibration::VCalibrationNotifications> notifications =
      std::make_shared<Calibration::VCalibrationNotifications>();
  std::shared_ptr<VSubjectCalibrationController> controller = Make({1h, 1h});
  const Id ada = Add(ESubjectKind::GeneralSubjects, "Ada");
  Session latest;
};

}

TEST_F(CalibrationControllerTest, ARunGoesThroughItsPhasesUnderItsSessionAlone)
{
  EXPECT_EQ(controller->LastResult(), IResult(EResult::NotSet));
  for (const ECalibrationAction action : {StartCalibration, StartRecalibration, AcceptTPose, Stop, Cancel})
    EXPECT_EQ(Perform(action), IResult(EResult::NotAvailable));
  ASSERT_TRUE(controller->SetTargetSubject(ada).Succeeded());
  EXPECT_EQ(Perform(StartCalibration), IResult(EResult::Ok));
  EXPECT_EQ(latest, Session(1));
  EXPECT_EQ(controller->Phase(), 1U);
  EXPECT_EQ(Shown(ada), 1);
  EXPECT_TRUE(ShownRunning());
  EXPECT_EQ(Perform(StartRecalibration), IResult(EResult::NotAvailable));
  EXPECT_EQ(Perform(Stop, 1), IResult(EResult::NotAvailable)) << "not before the T-pose";
  EXPECT_EQ(Perform(AcceptTPose, 2), IResult(EResult::InvalidSession));
  EXPECT_EQ(Perform(AcceptTPose, 0), IResult(EResult::InvalidSession));
  EXPECT_EQ(Perform(AcceptTPose, 1), IResult(EResult::Ok));
  EXPECT_EQ(controller->Phase(), 2U);
  EXPECT_EQ(Perform(AcceptTPose, 1), IResult(EResult::NotAvailable));
  EXPECT_EQ(Perform(Stop, 7), IResult(EResult::InvalidSession));
  EXPECT_EQ(Perform(Stop, 1), IResult(EResult::Ok));
  EXPECT_EQ(controller->Phase(), 0U);
  EXPECT_EQ(controller->LastResult(), IResult(EResult::Ok));
  EXPECT_EQ(Shown(ada), 2);
  EXPECT_FALSE(ShownRunning());

  EXPECT_EQ(Perform(StartRecalibration), IResult(EResult::Ok));
  EXPECT_EQ(latest, Session(2));
  EXPECT_EQ(Perform(Cancel, 1), IResult(EResult::InvalidSession)) << "a stale one";
  EXPECT_EQ(Perform(Cancel, 2), IResult(EResult::Ok));
  EXPECT_EQ(controller->LastResult(), IResult(EResult::Canceled));
  EXPECT_EQ(Shown(ada), 2) << "as it was before";
}

TEST_F(CalibrationControllerTest, ARefusalIsASentence)
{
  EXPECT_EQ(Reason(StartCalibration), "There is no subject to calibrate.");
  EXPECT_EQ(Reason(StartRecalibration), "No subject to recalibrate has been named.");
  EXPECT_EQ(Reason(Stop), "No subject calibration is running.");
  EXPECT_EQ(controller->SetTargetSubject(Id(99)), IResult(EResult::InvalidId));
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  EXPECT_TRUE(controller->SetTargetSubject(crate).Succeeded());
  EXPECT_EQ(Reason(StartRecalibration), "\"Crate\" is not a subject that can be calibrated.");
  EXPECT_TRUE(controller->SetTargetSubject(ada).Succeeded());
  EXPECT_EQ(controller->SetTargetSubjects({crate}), IResult(EResult::InvalidArgument));
  EXPECT_EQ(Reason(StartCalibration), "");
  EXPECT_TRUE(Perform(StartCalibration).Succeeded());
  EXPECT_EQ(Reason(StartCalibration), "A subject calibration is running.");
  EXPECT_EQ(Reason(Stop), "The T-pose has not been accepted yet.");
  EXPECT_TRUE(Perform(AcceptTPose, 1).Succeeded());
  EXPECT_EQ(Reason(AcceptTPose), "The T-pose has been accepted already.");
  EXPECT_TRUE(Perform(Cancel, 1).Succeeded());
  Remove(ada);
  EXPECT_EQ(Reason(StartCalibration), "The subject to calibrate does not exist any more.");
  EXPECT_NE(Reason(static_cast<ECalibrationAction>(9)), "");
}

TEST_F(CalibrationControllerTest, TimeEndsASearchAsAFailureAndACalibrationAsASuccess)
{
  controller = Make({1ms, 2ms});
  ASSERT_TRUE(controller->SetTargetSubject(ada).Succeeded());
  EXPECT_TRUE(Perform(StartCalibration).Succeeded());
  EXPECT_TRUE(timers->RunOne());
  EXPECT_EQ(controller->Phase(), 0U);
  EXPECT_EQ(controller->LastResult(), IResult(EResult::TimedOut));
  EXPECT_EQ(Shown(ada), 0);

  int states = 0;
  const auto subscription = notifications->StateChanged()->Subscribe(postal, [&] { ++states; });
  EXPECT_TRUE(Perform(StartCalibration).Succeeded());
  EXPECT_TRUE(Perform(AcceptTPose, 2).Succeeded());
  while (controller->Phase() == 2)
    ASSERT_TRUE(timers->RunOne());
  EXPECT_EQ(controller->Phase(), 3U);
  while (controller->Phase() == 3)
    ASSERT_TRUE(timers->RunOne());
  EXPECT_EQ(controller->LastResult(), IResult(EResult::Ok));
  EXPECT_EQ(Shown(ada), 2);
  postal->RunAll();
  EXPECT_EQ(states, 4);

  // A subject that is removed meanwhile was not calibrated.
  EXPECT_TRUE(Perform(StartRecalibration).Succeeded());
  EXPECT_TRUE(Perform(AcceptTPose, 3).Succeeded());
  Remove(ada);
  EXPECT_TRUE(Perform(Stop, 3).Succeeded());
  EXPECT_EQ(controller->LastResult(), IResult(EResult::NotFound));
  EXPECT_FALSE(ShownRunning());
}

TEST_F(CalibrationControllerTest, WhatTheStoreCannotKeepHasNotHappened)
{
  controller = Make({1h, 2ms});
  ASSERT_TRUE(controller->SetTargetSubject(ada).Succeeded());
  archive.full = true;
  EXPECT_EQ(Perform(StartCalibration), IResult(EResult::DiskFull));
  EXPECT_EQ(controller->Phase(), 0U);
  archive.full = false;
  EXPECT_TRUE(Perform(StartCalibration).Succeeded());
  EXPECT_EQ(latest, Session(1));
  archive.full = true;
  EXPECT_EQ(Perform(Cancel, 1), IResult(EResult::DiskFull));
  EXPECT_EQ(controller->Phase(), 1U);
  EXPECT_TRUE(Perform(AcceptTPose, 1).Succeeded());
  const LogCapture log;
  while (log.messages.empty())
    ASSERT_TRUE(timers->RunOne());
  EXPECT_THAT(log.messages, ElementsAre(HasSubstr("DiskFull")));
  EXPECT_EQ(controller->Phase(), 3U);
  archive.full = false;
  EXPECT_TRUE(timers->RunOne()) << "it is tried again";
  EXPECT_EQ(controller->LastResult(), IResult(EResult::Ok));
}

TEST_F(CalibrationControllerTest, WhatAnEarlierProgramLeftRunningHasEnded)
{
  ASSERT_TRUE(controller->SetTargetSubject(ada).Succeeded());
  EXPECT_TRUE(Perform(StartCalibration).Succeeded());
  controller->Stop();
  while (timers->RunOne()) // nothing but what was cancelled
    ;
  EXPECT_EQ(controller->Phase(), 1U);
  SetApplication(std::string(NMX::PathOf(NMX::ESetting::CreateSubjectName).Text()), std::string("Ada"));
  postal->RunAll();
  int told = 0;
  const auto subscription = notifications->PossibilitiesChanged()->Subscribe(postal, [&] { ++told; });
  controller = Make({1h, 1h});
  EXPECT_EQ(Shown(ada), 0);
  EXPECT_FALSE(ShownRunning());
  EXPECT_EQ(controller->LastResult(), IResult(EResult::NotSet));
  EXPECT_EQ(Reason(StartRecalibration), "") << "the subject of the name that was given is the target again";
  postal->RunAll();
  EXPECT_GT(std::exchange(told, 0), 0);
  SetApplication(std::string(NMX::PathOf(NMX::ESetting::CreateSubjectAction).Text()), NMX::Action{});
  postal->RunAll();
  EXPECT_EQ(std::exchange(told, 0), 1);
  Remove(ada);
  postal->RunAll();
  EXPECT_GT(told, 0);
}

TEST_F(CalibrationControllerTest, TheCreatorMakesWhatTemplateAndSkinSay)
{
  const TemporaryFolder folder;
  const auto write = [&](const char* name, const std::string& content)
  {
    std::ofstream(folder.Path() / name) << content;
    return NMX::ToWide((folder.Path() / name).string()).value();
  };
  const std::string segments = "<Segments><Segment name='Hip'/></Segments>";
  const auto labelling = write("K\xC3\xB6rper.lbt", "<LabellingTemplate version='1'>" + segments +
                                                        R"(<Children><Child kind="Props" name="Staff"/>
    <Child kind="LabellingClusters" name="Head" parent="Staff"/></Children>
    <Roles><Labelling>false</Labelling></Roles></LabellingTemplate>)");
  const auto skin = write("a.skin", "<SubjectSkin version='1'>" + segments +
                                        "<Roles><Retargeting>true</Retargeting></Roles>"
                                        "<ModelOutputs><CGM2>true</CGM2></ModelOutputs></SubjectSkin>");
  Calibration::VSubjectCreator creator;
  const auto create = [&](const char* name, const std::wstring& from, const std::wstring& with)
  {
    std::shared_ptr<const ISubjectTemplate> content;
    if (const IResult read = creator.ReadTemplate(from, with, content); read.Failed())
      return read;
    const auto editor = store->Editor();
    const IResult made = creator.CreateSubject(*editor, name, *content);
    return made.Failed() ? made : editor->Commit();
  };
  ASSERT_EQ(create("Zoe", labelling, skin), IResult(EResult::Ok));
  const auto find = [&](const char* name)
  {
    Id id;
    EXPECT_TRUE(store->Reader()->FindByName(name, id).Succeeded()) << name;
    return id;
  };
  const Id zoe = find("Zoe");
  EXPECT_EQ(Get<std::wstring>(zoe, Paths::FilePath()), labelling);
  const bool entries[] = {Get<bool>(zoe, Paths::RoleLabelling()), Get<bool>(zoe, Paths::RoleSolving()),
                          Get<bool>(zoe, Paths::RoleRetargeting()), Get<bool>(zoe, Paths::ModelOutputCGM2()),
                          Get<bool>(zoe, Paths::ModelOutputPluginKinex())};
  EXPECT_THAT(entries, ElementsAre(false, true, true, true, false));
  EXPECT_EQ(Get<Id>(find("Zoe Staff"), Paths::ParentSubjectId()), zoe);
  EXPECT_EQ(Get<Id>(find("Zoe Head"), Paths::ParentSubjectId()), find("Zoe Staff"));

  EXPECT_EQ(create("Ben", labelling, L""), IResult(EResult::Ok));
  EXPECT_FALSE(Get<bool>(find("Ben"), Paths::RoleSolving())) << "without a skin it is not solved";
  EXPECT_EQ(create("Zoe", labelling, skin), IResult(EResult::AlreadyPresent));
  EXPECT_EQ(create("", labelling, skin), IResult(EResult::InvalidName));
  Add(ESubjectKind::Props, "Eve Head");
  const LogCapture log;
  EXPECT_EQ(create("Eve", labelling, skin), IResult(EResult::AlreadyPresent));
  EXPECT_EQ(create(std::string(250, 'e').c_str(), labelling, skin), IResult(EResult::InvalidName));
  EXPECT_EQ(create("Eve", L"", skin), IResult(EResult::InvalidArgument));
  EXPECT_EQ(create("Eve", labelling + L"x", skin), IResult(EResult::FileNotFound));
  EXPECT_EQ(create("Eve", labelling, folder.Path().wstring()), IResult(EResult::FileIOFailure));
  EXPECT_EQ(create("Eve", skin, skin), IResult(EResult::SerialisationFailure));
  EXPECT_EQ(create("Eve", labelling, labelling), IResult(EResult::SerialisationFailure));
  Id eve;
  EXPECT_EQ(store->Reader()->FindByName("Eve", eve), IResult(EResult::NotFound));
  EXPECT_EQ(store->Reader()->FindByName("Eve Staff", eve), IResult(EResult::NotFound));
}
