#include "StandaloneHost/Settings/PanelSettings.h"

#include "StandaloneHost/Store/CreateActions.h"
#include "StoreInterface/SettingsPaths.h"
#include "tests/Support/StoreFixture.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <fstream>

using NMX::EResult;
using NMX::ESetting;
using NMX::EValueType;
using NMX::IResult;
using testing::ElementsAre;
using testing::IsEmpty;

namespace
{

class PanelSettingsTest : public StoreFixture
{
protected:
  PanelSettingsTest() { std::filesystem::create_directories(user); }

  void SetUpSettings()
  {
    ASSERT_TRUE(Settings::SetUpPanelSettings(*store, {{}, {}, {shipped, user}, {shipped}, {}}).Succeeded());
  }

  std::filesystem::path Touch(const std::filesystem::path& file) const
  {
    std::filesystem::create_directories(file.parent_path());
    std::ofstream{file};
    return file;
  }

  void SetSetting(ESetting setting, NMX::Value value)
  {
    SetApplication(std::string(NMX::PathOf(setting).Text()), std::move(value));
  }

  const NMX::Value& Setting(ESetting setting) const
  {
    const NMX::Value* value = store->Reader()->FindApplicationEntry(NMX::PathOf(setting));
    static const NMX::Value none;
    return value != nullptr ? *value : none;
  }

  NMX::Option Files(ESetting setting) const { return std::get<NMX::Option>(Setting(setting)); }

  /// Why a subject cannot be made; empty when it can.
  std::string Obstacle(ESetting setting = ESetting::CreateSubjectAction) const
  {
    const auto action = std::get<NMX::Action>(Setting(setting));
    EXPECT_EQ(action.state, action.text.empty() ? 0U : NMX::Action::impossible);
    return action.text;
  }

  const TemporaryFolder folder;
  const std::filesystem::path shipped = folder.Path() / "shipped";
  const std::filesystem::path user = folder.Path() / "user";
};

}

TEST_F(PanelSettingsTest, EverySettingHasAValueOfItsTypeAndKeepsWhatItWasSetTo)
{
  EXPECT_TRUE(store->Empty());
  SetSetting(ESetting::CaptureVideo, true);
  SetSetting(ESetting::CreateObjectName, 5);
  SetUpSettings();
  EXPECT_TRUE(store->Empty()) << "settings alone are no content";
  const struct
  {
    EValueType type;
    std::vector<ESetting> settings;
  } rows[] = {{EValueType::Bool,
               {ESetting::CalibrateOnCreate, ESetting::CaptureCancelledCalibrations, ESetting::CaptureProcessed,
                ESetting::CaptureVideo, ESetting::EnableCapture}},
              {EValueType::Double, {ESetting::CancelledCalibrationGracePeriod}},
              {EValueType::Text,
               {ESetting::CreateCFCName, ESetting::CreateLabellingClusterName, ESetting::CreateObjectName,
                ESetting::CreateSmartObjectName, ESetting::CreateSubjectName, ESetting::NameRegex}},
              {EValueType::Option,
               {ESetting::CreateCFCRetarget, ESetting::CreateCFCTemplate, ESetting::CreateSmartObjectTemplate,
                ESetting::CreateSubjectSkin, ESetting::CreateSubjectTemplate}},
              {EValueType::SubjectIds, {ESetting::LabellingClusterSelection}},
              {EValueType::Action,
               {ESetting::AddMarkerToObjectAction, ESetting::CalibrationAction, ESetting::CancelCalibrationAction,
                ESetting::CreateCFCAction, ESetting::CreateLabellingClusterAction, ESetting::CreateObjectAction,
                ESetting::CreateSmartObjectAction, ESetting::CreateSubjectAction, ESetting::LinkCameraAction,
                ESetting::RemoveMarkerFromObjectAction, ESetting::UnlinkCameraAction}}};
  std::size_t count = 1; // the root
  for (const auto& [type, settings] : rows)
    for (const ESetting setting : settings)
    {
      EXPECT_EQ(NMX::TypeOf(Setting(setting)), type) << NMX::PathOf(setting);
      ++count;
    }
  EXPECT_EQ(count, NMX::settingCount);
  EXPECT_EQ(Setting(ESetting::CaptureVideo), NMX::Value(true));
  EXPECT_EQ(Setting(ESetting::CreateObjectName), NMX::Value(std::string()));
  const int commits = archive.commits;
  SetUpSettings();
  EXPECT_EQ(archive.commits, commits) << "nothing to do the second time";
  EXPECT_EQ(NMX::SettingsPaths()[0].Text(), "Application/Settings/SubjectStore");
  EXPECT_EQ(NMX::SettingsPaths()[29].Text(), "Application/Settings/SubjectStore/UnlinkCameraAction");
}

TEST_F(PanelSettingsTest, FilesOfBothFoldersAreOfferedTheUsersFirst)
{
  Touch(shipped / "Small.lbt");
  Touch(shipped / "Gro\xC3\x9F.lbt");
  Touch(shipped / "Readme.txt");
  Touch(shipped / "Folder.lbt" / "Beneath.lbt");
  Touch(shipped / "Bad \xFF.lbt");
  const auto own = Touch(user / "Small.lbt");
  SetUpSettings();
  NMX::Option option = Files(ESetting::CreateSubjectTemplate);
  ASSERT_EQ(option.choices.size(), 2U);
  EXPECT_EQ(option.choices[0].name, "Gro\xC3\x9F");
  EXPECT_EQ(option.choices[1], (NMX::Choice{"Small", own.wstring()}));
  EXPECT_EQ(option.chosen, option.choices[0].path) << "the first, until somebody chooses";
  option.chosen = own.wstring();
  SetSetting(ESetting::CreateSubjectTemplate, option);
  Touch(user / "Another.lbt");
  SetUpSettings();
  EXPECT_EQ(Files(ESetting::CreateSubjectTemplate).choices.size(), 3U);
  EXPECT_EQ(Files(ESetting::CreateSubjectTemplate).chosen, own.wstring());
  std::filesystem::remove(own);
  SetUpSettings();
  EXPECT_EQ(Files(ESetting::CreateSubjectTemplate).chosen, (user / "Another.lbt").wstring());
  EXPECT_THAT(Files(ESetting::CreateSubjectSkin).choices, IsEmpty());
}

TEST_F(PanelSettingsTest, ActionsSayWhatStandsInTheirWay)
{
  EXPECT_EQ(Setting(ESetting::CreateSubjectAction), NMX::Value()) << "what does not exist is not made";
  Add(NMX::ESubjectKind::Props, "Ada");
  EXPECT_EQ(Setting(ESetting::CreateSubjectAction), NMX::Value());
  const auto file = Touch(shipped / "Small.lbt");
  SetUpSettings();
  EXPECT_EQ(Obstacle(), "No name is given.");
  SetSetting(ESetting::CreateSubjectName, std::string("Ada"));
  EXPECT_EQ(Obstacle(), "There is a subject named \"Ada\" already.");
  Id ada;
  EXPECT_TRUE(store->Reader()->FindByName("Ada", ada).Succeeded());
  Change([&](NMX::IEntryEditor& editor) { EXPECT_TRUE(editor.Rename(ada, "Eve", NMX::ENotify::Yes).Succeeded()); });
  EXPECT_EQ(Obstacle(), "");
  const Id other = Add(NMX::ESubjectKind::SmartObjects, "Ada");
  EXPECT_NE(Obstacle(), "");
  Remove(other);
  EXPECT_EQ(Obstacle(), "");
  SetSetting(ESetting::CreateSubjectTemplate, NMX::Option{L"", {{"Small", file.wstring()}}});
  EXPECT_EQ(Obstacle(), "No labelling template is chosen.");
  SetSetting(ESetting::CreateSubjectTemplate, NMX::Option{file.wstring(), {{"Small", file.wstring()}}});
  SetSetting(ESetting::CreateSubjectName, std::string("A/B"));
  EXPECT_EQ(Obstacle(), "The name \"A/B\" is not allowed.");
  SetSetting(ESetting::CreateSubjectName, std::string(1024, 'x'));
  EXPECT_EQ(Obstacle(), "The name is too long.") << "and is not repeated in the reason";
  SetSetting(ESetting::CreateSubjectName, std::string("Ada"));
  SetSetting(ESetting::CreateSubjectAction, NMX::Action{2, "Whatever."});
  EXPECT_EQ(Obstacle(), "") << "what somebody else writes does not last";

  EXPECT_EQ(Obstacle(ESetting::CalibrationAction), "");
  EXPECT_EQ(Obstacle(ESetting::CancelCalibrationAction), "No subject calibration is running.");
  SetApplication(std::string(Store::CalibrationRunning().Text()), true);
  EXPECT_EQ(Obstacle(), "A subject calibration is running.");
  EXPECT_EQ(Obstacle(ESetting::CalibrationAction), "A subject calibration is running.");
  EXPECT_EQ(Obstacle(ESetting::CancelCalibrationAction), "");
  EXPECT_EQ(Obstacle(ESetting::CreateObjectAction), "No name is given.");
  SetSetting(ESetting::CreateObjectName, std::string("Crate"));
  EXPECT_EQ(Obstacle(ESetting::CreateObjectAction), "") << "neither a file nor a calibration matters to it";
}

TEST_F(PanelSettingsTest, TheNamePatternIsASettingWhichNeverThrows)
{
  SetUpSettings();
  const auto allowed = [&](const std::string& name)
  {
    Id id;
    return store->Editor()->Add(NMX::ESubjectKind::Props, name, id).Succeeded();
  };
  EXPECT_TRUE(allowed("Ada 1"));
  SetSetting(ESetting::NameRegex, std::string("[A-Z]+"));
  EXPECT_EQ(store->Reader()->NamePattern(), "[A-Z]+");
  EXPECT_FALSE(allowed("Ada 1"));
  EXPECT_TRUE(allowed("ADA"));
  SetSetting(ESetting::NameRegex, std::string(".*"));
  EXPECT_FALSE(allowed("A/B")) << "files are named after subjects, whatever the setting";
  for (const char* pattern : {"[", "(a+)+$", "(?<n"})
  {
    SetSetting(ESetting::NameRegex, std::string(pattern));
    EXPECT_FALSE(allowed(std::string(200, 'a') + '!')) << pattern;
  }
  SetSetting(ESetting::NameRegex, std::string());
  EXPECT_TRUE(allowed("Ada 1"));
}
