#include "StandaloneHost/Characters/VCharacterControls.h"

#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualAsioPostal.h"
#include "tests/Support/StoreFixture.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <fstream>

using NMX::EResult;
using NMX::IResult;
using Id = NMX::TSubjectStoreId;
using testing::ElementsAre;
using testing::HasSubstr;
namespace Paths = NMX::Paths;

namespace
{

class CharacterControlsTest : public StoreFixture
{
protected:
  /// What a service does with the controls.
  template <class Step>
  IResult Edit(Step step)
  {
    const auto editor = store->Editor();
    const IResult result = step(*editor);
    return result.Failed() ? result : editor->Commit();
  }

  IResult Create(const std::string& name, const std::filesystem::path& file)
  {
    std::shared_ptr<const ICharacterTemplate> content;
    const IResult read = controls->ReadTemplate(file, content);
    return read.Failed() ? read
                         : Edit([&](NMX::IEntryEditor& editor)
                                { return controls->CreateFromTemplate(editor, name, *content); });
  }

  IResult Calibrate(Id id)
  {
    return Edit([&](NMX::IEntryEditor& editor) { return controls->Calibrate(editor, id); });
  }

  Id Find(const char* name) const
  {
    Id id;
    EXPECT_TRUE(store->Reader()->FindByName(name, id).Succeeded());
    return id;
  }

  std::int32_t State(Id id) const { return Get<std::int32_t>(id, Paths::Calibration()); }

  std::filesystem::path Write(const char* name, const std::string& text)
  {
    std::ofstream(folder.Path() / name) << text;
    return folder.Path() / name;
  }

  const std::string actor = R"(<CharacterTemplate version="1"><Segments><Segment name="Hip"/></Segments>
    <Slots><Slot name="Belt" segment="Hip"/><Slot name="Tail" segment="Hip"/></Slots>
    <Roles><Solving>false</Solving><Retargeting>true</Retargeting></Roles></CharacterTemplate>)";
  const TemporaryFolder folder;
  std::shared_ptr<ManualAsioPostal> postal = std::make_shared<ManualAsioPostal>();
  std::shared_ptr<Characters::VCharacterControls> controls =
      std::make_shared<Characters::VCharacterControls>(store, postal, std::chrono::milliseconds(1));
};

}

TEST_F(CharacterControlsTest, ATemplateGivesACharacterItsSlotsAndRoles)
{
  ASSERT_EQ(Create("Ada", Write("Actör.cct", actor)), IResult(EResult::Ok));
  const Id ada = Find("Ada");
  const auto reader = store->Reader();
  std::vector<NMX::Slot> slots;
  bool solving = true;
  bool retargeting = false;
  EXPECT_TRUE(NMX::Read(*reader, ada, Paths::Slots(), slots).Succeeded());
  EXPECT_THAT(slots, ElementsAre(NMX::Slot{Id(1), "Belt"}, NMX::Slot{Id(2), "Tail"}));
  EXPECT_TRUE(NMX::Read(*reader, ada, Paths::RoleSolving(), solving).Succeeded());
  EXPECT_TRUE(NMX::Read(*reader, ada, Paths::RoleRetargeting(), retargeting).Succeeded());
  EXPECT_TRUE(!solving && retargeting);
}

TEST_F(CharacterControlsTest, EachThingWrongWithATemplateHasItsResultAndNothingIsMade)
{
  const auto good = Write("good.cct", actor);
  ASSERT_TRUE(Create("Ada", good).Succeeded());
  const LogCapture log;
  EXPECT_EQ(Create("Ada", good), IResult(EResult::AlreadyPresent));
  EXPECT_EQ(Create("A/B", good), IResult(EResult::InvalidName));
  EXPECT_EQ(Create("Ben", ""), IResult(EResult::InvalidArgument));
  EXPECT_EQ(Create("Ben", folder.Path() / "missing.cct"), IResult(EResult::FileNotFound));
  EXPECT_EQ(Create("Ben", good / "beneath a file.cct"), IResult(EResult::FileNotFound));
  EXPECT_THAT(log.messages, testing::IsEmpty());
  EXPECT_EQ(Create("Ben", folder.Path()), IResult(EResult::FileIOFailure));
  EXPECT_EQ(Create("Ben", "/dev/zero"), IResult(EResult::FileIOFailure));
  EXPECT_EQ(Create("Ben", Write("cut.cct", actor.substr(0, 90))), IResult(EResult::SerialisationFailure));
  EXPECT_EQ(Create("Ben", Write("empty.cct", "")), IResult(EResult::SerialisationFailure));
  EXPECT_THAT(log.messages, ElementsAre(HasSubstr("directory"), HasSubstr("device"), HasSubstr("cut.cct:2:"),
                                        HasSubstr("empty.cct:1:1: the file is empty")));
  Id id;
  EXPECT_EQ(store->Reader()->FindByName("Ben", id), IResult(EResult::NotFound));
}

TEST_F(CharacterControlsTest, ACalibrationRunsUntilItIsDoneClearedOrStartedAfresh)
{
  ASSERT_TRUE(Create("Ada", Write("actor.cct", actor)).Succeeded());
  const Id ada = Find("Ada");
  EXPECT_TRUE(Calibrate(ada).Succeeded());
  EXPECT_EQ(State(ada), 1);
  EXPECT_TRUE(postal->RunOne());
  EXPECT_EQ(State(ada), 2);

  EXPECT_TRUE(Calibrate(ada).Succeeded());
  EXPECT_EQ(State(ada), 1);
  EXPECT_TRUE(Edit([&](NMX::IEntryEditor& editor) { return controls->ClearCalibration(editor, ada); }).Succeeded());
  EXPECT_EQ(State(ada), 0);
  EXPECT_TRUE(postal->RunOne());
  EXPECT_EQ(State(ada), 0) << "the run was cancelled";

  EXPECT_TRUE(Calibrate(ada).Succeeded());
  EXPECT_TRUE(Calibrate(ada).Succeeded());
  EXPECT_TRUE(postal->RunOne());
  EXPECT_EQ(State(ada), 1) << "the first run was replaced";
  EXPECT_TRUE(postal->RunOne());
  EXPECT_EQ(State(ada), 2);

  EXPECT_EQ(Edit(
                [&](NMX::IEntryEditor& editor)
                {
                  EXPECT_TRUE(controls->Calibrate(editor, ada).Succeeded());
                  return IResult(EResult::Failed);
                }),
            IResult(EResult::Failed));
  EXPECT_TRUE(postal->RunOne());
  EXPECT_EQ(State(ada), 2) << "an edit that is not committed starts nothing";

  EXPECT_TRUE(Calibrate(ada).Succeeded());
  Remove(ada);
  EXPECT_TRUE(postal->RunOne());
  EXPECT_FALSE(postal->RunOne()) << "nothing is left to run";
}

TEST_F(CharacterControlsTest, ACalibrationOutlivesARestartAndAFullDisk)
{
  ASSERT_TRUE(Create("Ada", Write("actor.cct", actor)).Succeeded());
  const Id ada = Find("Ada");
  EXPECT_TRUE(Calibrate(ada).Succeeded());
  controls->Stop();
  while (postal->RunOne())
    ;
  EXPECT_EQ(State(ada), 1);

  controls = std::make_shared<Characters::VCharacterControls>(store, postal, std::chrono::milliseconds(1));
  archive.full = true;
  const LogCapture log;
  EXPECT_TRUE(postal->RunOne());
  EXPECT_EQ(State(ada), 1);
  EXPECT_THAT(log.messages, ElementsAre(HasSubstr("DiskFull")));
  archive.full = false;
  EXPECT_TRUE(postal->RunOne());
  EXPECT_EQ(State(ada), 2);
}
