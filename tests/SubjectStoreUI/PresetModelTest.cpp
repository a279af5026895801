#include "SubjectStoreUI/VStoreObjectPresetModel.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/MockStore.h"
#include "tests/Support/StoreFixture.h"

#include <QAbstractItemModelTester>
#include <QMetaMethod>
#include <QSignalSpy>

#include <gmock/gmock.h>

using namespace SubjectStoreUI;
using NMX::ESubjectKind;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::NiceMock;
namespace Paths = NMX::Paths;
namespace Role = ObjectPresetRole;
using Model = VStoreObjectPresetModel;

namespace
{

const std::string presets = "Application/ObjectPresets/";

class PresetModelTest : public StoreFixture
{
protected:
  std::shared_ptr<Model> Make(std::function<Id()> selected = nullptr)
  {
    return NMX::MakeShared<Model>(store, gui, std::move(selected));
  }

  void SetAll(const std::vector<std::pair<std::string, NMX::Value>>& entries)
  {
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          for (const auto& [key, value] : entries)
            EXPECT_TRUE(editor.SetApplicationEntry(NMX::EntryPath(presets + key), value).Succeeded());
        });
  }

  /// Every row: "1 Crate; 2 Glove read-only".
  static std::string Rows(const Model& model)
  {
    QStringList rows;
    for (int row = 0; row < model.rowCount(); ++row)
    {
      const QModelIndex index = model.index(row);
      rows << index.data(Role::StoreId).value<VStoreIdGadget>().toString() + ' ' + index.data(Role::Name).toString() +
                  (index.data(Role::ReadOnly).toBool() ? " read-only" : "");
    }
    return rows.join("; ").toStdString();
  }

  /// What the store has beneath a preset.
  std::vector<std::string> Entries(const std::string& preset) const
  {
    std::vector<std::string> entries;
    for (const NMX::EntryPath& path : store->Reader()->ApplicationEntries(NMX::EntryPath(presets + preset)))
      entries.emplace_back(path.Text().substr(presets.size() + preset.size() + 1));
    return entries;
  }

  NMX::Value Entry(const std::string& key) const
  {
    const auto reader = store->Reader();
    const NMX::Value* value = reader->FindApplicationEntry(NMX::EntryPath(presets + key));
    return value != nullptr ? *value : NMX::Value{};
  }

  std::shared_ptr<ManualPostal> gui = std::make_shared<ManualPostal>();
};

VStoreIdGadget Preset(unsigned long long number)
{
  return VStoreIdGadget(NMX::TSubjectStoreId(number));
}

}

TEST_F(PresetModelTest, RowsAreTheWellFormedPresetsInTheOrderOfTheirNumbers)
{
  SetAll({{"10/Name", std::string("Ten")},
          {"10/ReadOnly", true},
          {"9/Name", std::string("Nine \xC3\xA4")},
          {"9/Parameters/Name", std::string("not its name")},
          {"18446744073709551615/Name", std::string("Last")},
          {"18446744073709551615/ReadOnly", std::string("true")}});
  for (const char* key :
       {"18446744073709551616/Name", "3/Name/More", "0/Name", "09/Name", "-4/Name", "4xName", "/Name", "Name", "5"})
    SetAll({{key, std::string("malformed")}});
  SetAll({{"1/ReadOnly", true}, {"2/Name", 5}});
  SetApplication("Application/ObjectPresetsOld/6/Name", std::string("elsewhere"));
  const auto model = Make();
  const QAbstractItemModelTester tester(model.get(), QAbstractItemModelTester::FailureReportingMode::Fatal);
  EXPECT_EQ(Rows(*model), "9 Nine \xC3\xA4; 10 Ten read-only; 18446744073709551615 Last");

  const QModelIndex last = model->index(2);
  EXPECT_EQ(last.data(Role::ReadOnly), QVariant(false));
  for (const int role : {256, 260, static_cast<int>(Qt::DisplayRole), -1})
    EXPECT_FALSE(last.data(role).isValid()) << role;
  EXPECT_FALSE(model->data({}, Role::Name).isValid());
  const auto other = Make();
  EXPECT_FALSE(model->data(other->index(0), Role::Name).isValid()) << "a row of another model";
  EXPECT_EQ(model->rowCount(last), 0);
  SetAll({{"9/Name", {}}});
  gui->RunAll();
  EXPECT_FALSE(model->data(last, Role::Name).isValid()) << "there are only two rows now";
  EXPECT_EQ(model->roleNames(), (QHash<int, QByteArray>{{257, "storeId"}, {258, "name"}, {259, "readOnly"}}));
}

TEST_F(PresetModelTest, ANewNameIsOneThatNoPresetHas)
{
  SetAll({{"1/Name", std::string("Default")}, {"2/Name", std::string("\xC3\xA4")}});
  const auto model = Make();
  EXPECT_FALSE(model->presetNameIsValid(QString(1025, QChar(u'n'))));
  for (const auto& [name, valid] : std::initializer_list<std::pair<const char*, bool>>{{"", false},
                                                                                       {"Default", false},
                                                                                       {"default", true},
                                                                                       {"Default ", true},
                                                                                       {"\xC3\xA4", false},
                                                                                       {"a\xCC\x88", true}})
  {
    EXPECT_EQ(model->presetNameIsValid(QString::fromUtf8(name)), valid) << name;
    EXPECT_TRUE(valid || !model->addPreset(QString::fromUtf8(name))) << name;
  }
  EXPECT_EQ(archive.commits, 1);
}

TEST_F(PresetModelTest, ANewPresetTakesWhatItKeepsFromTheSelectedObject)
{
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  const Id glove = Add(ESubjectKind::SmartObjects, "Glove");
  const Id cluster = Add(ESubjectKind::LabellingClusters, "Hip");
  Set(crate, Paths::ColourRGBA(), NMX::Colour{1, 2, 3, 4});
  Set(crate, Paths::ProximityGroupName(), std::string("Near"));
  Set(crate, Paths::TemplateGroupName(), std::string("Crates"));
  Set(glove, Paths::TemplateGroupName(), NMX::Value{});
  // A number without a name is no preset, but it is not free either.
  SetAll({{"9/Name", std::string("Old")}, {"10/ReadOnly", true}});
  Id selected;
  const auto model = Make([&] { return selected; });
  const struct
  {
    Id selected;
    std::vector<std::string> entries;
  } cases[] = {
      {crate,
       {"Name", "Parameters/ColourRGBA", "Parameters/ProximityGroupName", "Parameters/TemplateGroupName", "ReadOnly"}},
      {glove, {"Name", "Parameters/ColourRGBA", "Parameters/ProximityGroupName", "ReadOnly"}},
      {cluster, {"Name", "ReadOnly"}},
      {Id(99), {"Name", "ReadOnly"}},
      {Id(), {"Name", "ReadOnly"}}};
  int number = 11;
  for (const auto& added : cases)
  {
    const int commits = archive.commits;
    const std::string preset = std::to_string(number++);
    selected = added.selected;
    EXPECT_TRUE(model->addPreset(QString::fromStdString("P" + preset)));
    EXPECT_EQ(archive.commits, commits + 1);
    EXPECT_THAT(Entries(preset), testing::ElementsAreArray(added.entries)) << preset;
    EXPECT_EQ(Entry(preset + "/ReadOnly"), NMX::Value(false));
  }
  EXPECT_EQ(Entry("11/Parameters/ColourRGBA"), NMX::Value(NMX::Colour{1, 2, 3, 4}));
  EXPECT_EQ(Entry("11/Parameters/ProximityGroupName"), NMX::Value(std::string("Near")));
  EXPECT_EQ(Entry("11/Parameters/TemplateGroupName"), NMX::Value(std::string("Crates")));
  EXPECT_TRUE(Make()->addPreset("No selection"));
  EXPECT_THAT(Entries("16"), ElementsAre("Name", "ReadOnly"));
  EXPECT_EQ(Rows(*model), "9 Old");
  EXPECT_FALSE(model->addPreset("P11")) << "the rows do not show it yet, but the store has it";
  gui->RunAll();
  EXPECT_EQ(Rows(*model), "9 Old; 11 P11; 12 P12; 13 P13; 14 P14; 15 P15; 16 No selection");
}

TEST_F(PresetModelTest, OnlyAPresetThatIsNotReadOnlyIsRemovedWithAllItsEntries)
{
  SetAll({{"1/Name", std::string("Mine")},
          {"1/ReadOnly", false},
          {"1/Parameters/ColourRGBA", NMX::Colour{}},
          {"1/Parameters/Of/Later", 5},
          {"11/Name", std::string("Theirs")},
          {"11/ReadOnly", true},
          {"12/ReadOnly", false}});
  const auto model = Make();
  const int commits = archive.commits;
  const LogCapture log;
  for (const VStoreIdGadget& preset : {Preset(11), Preset(12), Preset(77), VStoreIdGadget()})
    EXPECT_FALSE(model->removePreset(preset)) << preset.Id();
  EXPECT_THAT(log.messages, ElementsAre("Object preset 'Theirs' is read-only, it is not removed."));
  EXPECT_FALSE(NMX::EntryPath::Known("Application/ObjectPresets/77")) << "an id from outside leaves nothing behind";
  EXPECT_EQ(archive.commits, commits);
  EXPECT_TRUE(model->removePreset(Preset(1)));
  EXPECT_EQ(archive.commits, commits + 1);
  EXPECT_THAT(Entries("1"), IsEmpty());
  EXPECT_THAT(Entries("11"), ElementsAre("Name", "ReadOnly"));
  EXPECT_THAT(Entries("12"), ElementsAre("ReadOnly"));
  EXPECT_EQ(Rows(*model), "1 Mine; 11 Theirs read-only");
  EXPECT_FALSE(model->removePreset(Preset(1))) << "although the rows still show it";
  gui->RunAll();
  EXPECT_EQ(Rows(*model), "11 Theirs read-only");
}

TEST_F(PresetModelTest, WhatTheStoreRefusesChangesNothing)
{
  SetAll({{"1/Name", std::string("Mine")}});
  const auto model = Make();
  archive.full = true;
  EXPECT_FALSE(model->addPreset("New"));
  EXPECT_FALSE(model->removePreset(Preset(1)));
  archive.full = false;
  EXPECT_THAT(Entries("2"), IsEmpty());
  EXPECT_THAT(Entries("1"), ElementsAre("Name"));
  SetAll({{"18446744073709551615/ReadOnly", true}});
  EXPECT_FALSE(model->addPreset("New")) << "there is no greater number";
  EXPECT_THAT(Entries("0"), IsEmpty());
}

TEST_F(PresetModelTest, EachChangeOfPresetsIsOneReset)
{
  const auto model = Make();
  const QAbstractItemModelTester tester(model.get(), QAbstractItemModelTester::FailureReportingMode::Fatal);
  QSignalSpy resets(model.get(), &Model::modelReset);
  QSignalSpy inserted(model.get(), &Model::rowsInserted);
  QSignalSpy removed(model.get(), &Model::rowsRemoved);
  QSignalSpy changed(model.get(), &Model::dataChanged);
  SetAll({{"2/Name", std::string("A")}, {"2/ReadOnly", true}, {"1/Name", std::string("B")}});
  SetApplication("Application/Settings/Other", true);
  Add(ESubjectKind::Props, "Chair");
  EXPECT_EQ(gui->RunAll(), 1);
  EXPECT_EQ(resets.count(), 1);
  EXPECT_EQ(Rows(*model), "1 B; 2 A read-only");
  SetAll({{"2/Parameters/ColourRGBA", NMX::Colour{}}});
  SetAll({{"1/Name", std::string("C")}});
  gui->RunAll();
  EXPECT_EQ(resets.count(), 3);
  EXPECT_EQ(Rows(*model), "1 C; 2 A read-only");

  // Whoever hears of a reset may edit the store: no access is open.
  std::vector<bool> edited;
  const auto add = [&](const char* name)
  {
    if (edited.size() < 2)
      edited.push_back(model->addPreset(name));
  };
  QObject::connect(model.get(), &Model::modelAboutToBeReset, model.get(), [&] { add("While resetting"); });
  QObject::connect(model.get(), &Model::modelReset, model.get(), [&] { add("After it"); });
  EXPECT_TRUE(model->removePreset(Preset(1)));
  gui->RunAll();
  EXPECT_THAT(edited, ElementsAre(true, true));
  EXPECT_EQ(Rows(*model), "2 A read-only; 3 While resetting; 4 After it");
  EXPECT_EQ(inserted.count() + removed.count() + changed.count(), 0);
}

TEST_F(PresetModelTest, ANotificationThatComesTooLateFindsNobody)
{
  std::function<void()> tell;
  const auto watched = std::make_shared<NiceMock<MockStore>>();
  EXPECT_CALL(*watched, OnChange)
      .WillOnce(
          [&](const std::string&, const std::weak_ptr<NMX::IPostalService>&, std::function<void()> handler)
          {
            tell = std::move(handler);
            return nullptr;
          });
  EXPECT_CALL(*watched, Reader).Times(2).WillRepeatedly([] { return std::make_unique<NiceMock<MockEditor>>(); });
  auto model = NMX::MakeShared<Model>(watched, gui, nullptr);
  tell();
  model.reset();
  tell();
}

TEST_F(PresetModelTest, ScriptsCallThreeOperations)
{
  const QMetaObject& meta = Model::staticMetaObject;
  std::vector<std::string> invokable;
  for (int method = meta.methodOffset(); method < meta.methodCount(); ++method)
    invokable.push_back(meta.method(method).methodSignature().toStdString());
  EXPECT_THAT(invokable, ElementsAre("addPreset(QString)", "removePreset(SubjectStoreUI::VStoreIdGadget)",
                                     "presetNameIsValid(QString)"));
}
