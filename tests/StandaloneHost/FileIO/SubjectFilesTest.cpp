#include "StoreInterface/CalibrationState.h"
#include "tests/StandaloneHost/FileIO/FileIOFixture.h"
#include "tests/Support/RandomStoreEdits.h"
#include "tests/Support/RandomTexts.h"

#include <algorithm>
#include <limits>

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
namespace Paths = NMX::Paths;

namespace
{

/// A value of the type that is no entry's default.
NMX::Value Unusual(const Store::SchemaEntry& entry)
{
  using enum NMX::EValueType;
  switch (entry.type)
  {
  case Bool:
    return !std::get<bool>(entry.initial);
  case Int32:
    return std::int32_t{-7};
  case UInt32:
    return entry.path == Paths::Flags() ? std::get<std::uint32_t>(entry.initial) | NMX::SubjectFlag::installed
                                        : std::numeric_limits<std::uint32_t>::max();
  case Text:
    return awkward;
  case WideText:
    return NMX::ToWide(awkward).value();
  case Colour:
    return NMX::Colour{1, 0x23, 0xFE, 0};
  case Positions:
    return std::vector<NMX::Position>{{0.1, -0.0, 1e-300}, {-1.0 / 3, 1.7976931348623157e308, 12345678.9}};
  case SmartClusters:
    return std::vector<NMX::SmartCluster>{{awkward, awkward, 4294967295U, awkward}, {"b", "", 0, "t"}};
  case Slots:
    return std::vector<NMX::Slot>{{NMX::TSubjectStoreId(9), awkward}, {NMX::TSubjectStoreId(4), "Second"}};
  default:
    return {};
  }
}

class SubjectFilesTest : public FileIOTest
{
protected:
  /// Adds a subject whose entries are all unusual.
  Id AddUnusual(ESubjectKind kind, std::string_view name)
  {
    const Id id = Add(kind, name);
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          for (const Store::SchemaEntry& entry : Store::KindSchema::Of(kind).Entries())
          {
            NMX::Value value = Unusual(entry);
            if (entry.writer != Store::EWriter::Anyone || std::holds_alternative<std::monostate>(value))
              continue;
            EXPECT_TRUE(editor.SetValue(id, entry.path, std::move(value)).Succeeded()) << entry.path;
          }
        });
    return id;
  }
};

TEST_F(SubjectFilesTest, WhatIsSavedIsLoadedAgain)
{
  LoadStage();
  std::map<ESubjectKind, Id> unusual;
  for (const ESubjectKind kind : NMX::allSubjectKinds)
    unusual[kind] = AddUnusual(kind, "A & 'b' é " + std::string(NMX::KindKey(kind)));
  // A smart object in a slot whose number is not its position, and chains of parents against the order of the kinds
  const Id character = unusual[ESubjectKind::CharactersFromClusters];
  Set(unusual[ESubjectKind::SmartObjects], Paths::ParentSubjectId(), character);
  Set(unusual[ESubjectKind::SmartObjects], Paths::ParentSubjectSlotId(), Id(4));
  Set(unusual[ESubjectKind::Props], Paths::ParentSubjectId(), character);
  Set(character, Paths::ParentSubjectId(), unusual[ESubjectKind::SceneMeshes]);
  SetApplication("Application/Devices/u & <v>/Type", awkward);
  for (const auto& [entry, value] : std::map<std::string, NMX::Value>{{"Name", awkward},
                                                                      {"ReadOnly", true},
                                                                      {"Parameters/FilePath", L"c:\\a"},
                                                                      {"Parameters/EntranceThreshold", 7U},
                                                                      {"Parameters/Enabled", false}})
    SetApplication("Application/ObjectPresets/77/" + entry, value);
  StoreDump before = Dump(*store);
  // What has no name is no preset, and a device that is rebooting is as one that is connected.
  SetApplication("Application/ObjectPresets/78/ReadOnly", true);
  SetApplication("Application/Devices/corvex1-0411/Connected", false);
  SetApplication("Application/Devices/corvex1-0411/Rebooting", true);
  // A device is written with all of its state.
  for (const auto& [entry, value] :
       std::map<std::string, NMX::Value>{{"Connected", false}, {"Charging", false}, {"Battery", 0U}, {"Radio", 0U}})
    before.application["Application/Devices/u & <v>/" + entry] = value;

  ASSERT_EQ(Save(file), IResult(EResult::Ok)) << reason;
  ASSERT_EQ(otherIO.LoadSubjectConfiguration(Wide(file), reason), IResult(EResult::Ok)) << reason;
  const StoreDump after = Dump(*other);
  ASSERT_EQ(after.subjects.size(), before.subjects.size());
  for (const auto& [name, subject] : before.subjects)
    EXPECT_TRUE(after.subjects.at(name) == subject) << name;
  EXPECT_TRUE(after.application == before.application);
  EXPECT_EQ(reason, "");
}

TEST_F(SubjectFilesTest, AnyTextIsLoadedAsItWasSaved)
{
  RandomTexts texts(5);
  const auto text = [&] { return texts.Text(1024); };
  const auto randomValue = [&](NMX::EValueType type) -> NMX::Value
  {
    if (type == NMX::EValueType::Text)
      return text();
    if (type == NMX::EValueType::WideText)
      return NMX::ToWide(texts.Text(4096)).value();
    if (type == NMX::EValueType::SmartClusters)
      return std::vector<NMX::SmartCluster>{{text(), text(), 1, text()}, {text(), text(), 2, text()}};
    return std::vector<NMX::Slot>{{Id(1), text()}, {Id(2), text()}, {Id(3), "Same"}, {Id(4), "Same"}};
  };
  for (int round = 0; round < 60; ++round)
  {
    store = NMX::MakeShared<Store::VStore>();
    other = NMX::MakeShared<Store::VStore>();
    for (const ESubjectKind kind : NMX::allSubjectKinds)
    {
      const Id id = Add(kind, std::string(NMX::KindKey(kind)) + " 100%\u00E9");
      for (const Store::SchemaEntry& entry : Store::KindSchema::Of(kind).Entries())
        if (entry.writer == Store::EWriter::Anyone &&
            (entry.type == NMX::EValueType::Text || entry.type == NMX::EValueType::WideText ||
             entry.type == NMX::EValueType::SmartClusters || entry.type == NMX::EValueType::Slots))
          Set(id, entry.path, randomValue(entry.type));
    }
    std::string urn = "u" + texts.Text(254);
    std::ranges::replace(urn, '/', '-');
    for (const auto& [entry, value] : std::map<std::string, NMX::Value>{{"Type", "t" + texts.Text(1023)},
                                                                        {"Connected", true},
                                                                        {"Charging", false},
                                                                        {"Battery", 1U},
                                                                        {"Radio", 2U}})
      SetApplication("Application/Devices/" + urn + '/' + entry, value);
    SetApplication("Application/ObjectPresets/7/Name", "n" + texts.Text(1023));
    SetApplication("Application/ObjectPresets/7/ReadOnly", false);
    SetApplication("Application/ObjectPresets/7/Parameters/PresetName", text());
    FileIO::VRunaCoreFileIO saving(store);
    FileIO::VRunaCoreFileIO loading(other);
    ASSERT_TRUE(saving.SaveSubjectConfiguration(Wide(file), reason).Succeeded()) << reason;
    ASSERT_TRUE(loading.LoadSubjectConfiguration(Wide(file), reason).Succeeded()) << reason;
    ASSERT_TRUE(Dump(*other) == Dump(*store)) << round;
  }
}

TEST_F(SubjectFilesTest, AnyStoreIsLoadedAsItWasSaved)
{
  RandomStoreEdits edits(11);
  for (int round = 0; round < 20; ++round)
  {
    for (int i = 0; i < 40; ++i)
      edits.Transaction(*store);
    Change(
        [](NMX::IEntryEditor& editor)
        {
          // What no file can say: slots that hold something else than an object.
          std::vector<Id> ids;
          for (const ESubjectKind kind :
               {ESubjectKind::GeneralSubjects, ESubjectKind::Props, ESubjectKind::CharactersFromClusters})
          {
            EXPECT_TRUE(editor.Subjects(kind, ids).Succeeded());
            for (const Id id : ids)
              EXPECT_TRUE(editor.SetValue(id, Paths::ParentSubjectSlotId(), Id{}).Succeeded());
          }
        });
    ASSERT_TRUE(Save(file).Succeeded()) << reason;
    ASSERT_TRUE(otherIO.LoadSubjectConfiguration(Wide(file), reason).Succeeded()) << reason;
    ASSERT_TRUE(Dump(*other) == Dump(*store)) << round;
  }
}

TEST_F(SubjectFilesTest, LoadingReplacesSubjectsAndPresetsInOneEditAndKeepsDevices)
{
  LoadStage();
  ASSERT_TRUE(Save(file).Succeeded()) << reason;
  StoreDump expected = Dump(*store);
  Add(ESubjectKind::Props, "Barrel");
  Set(Find("Crate"), Paths::Enabled(), false);
  SetApplication("Application/ObjectPresets/9/Name", std::string("Other"));
  SetApplication("Application/Devices/corvex1-0411/Battery", 3U);
  for (const char* entry : {"Battery", "Charging", "Connected", "Radio", "Type"})
    SetApplication("Application/Devices/corvex1-0418/" + std::string(entry), {});
  SetApplication("Application/Devices/new/Type", std::string("Corvex1"));
  expected.application["Application/Devices/corvex1-0411/Battery"] = 3U;
  expected.application["Application/Devices/new/Type"] = std::string("Corvex1");

  const int commits = archive.commits;
  ASSERT_TRUE(Load(file).Succeeded()) << reason;
  EXPECT_EQ(archive.commits, commits + 1);
  EXPECT_TRUE(Dump(*store) == expected);
}

TEST_F(SubjectFilesTest, ACalibrationThatRanWhenTheFileWasWrittenDoesNotRunOnceItIsLoaded)
{
  Set(Add(ESubjectKind::CharactersFromClusters, "Ada"), Paths::Calibration(), NMX::CalibrationState::running);
  Set(Add(ESubjectKind::CharactersFromClusters, "Ben"), Paths::Calibration(), NMX::CalibrationState::done);
  ASSERT_TRUE(Save(file).Succeeded() && Load(file).Succeeded()) << reason;
  EXPECT_EQ(Get<std::int32_t>(Find("Ada"), Paths::Calibration()), NMX::CalibrationState::none);
  EXPECT_EQ(Get<std::int32_t>(Find("Ben"), Paths::Calibration()), NMX::CalibrationState::done);
}

TEST_F(SubjectFilesTest, ExportedSubjectsAreImportedWithWhatIsBeneathThemAndNothingElse)
{
  LoadStage();
  Set(Find("Ranger"), Paths::ParentSubjectId(), Find("Innkeeper"));
  Set(Find("Crate"), Paths::ParentSubjectId(), Find("Left glove"));
  StoreDump expected = Dump(*store);
  ASSERT_TRUE(io.ExportSubject(Find("Ranger"), Wide(file), reason).Succeeded()) << reason;
  ASSERT_TRUE(otherIO.ImportSubject(Wide(file), false, reason).Succeeded()) << reason;
  const StoreDump imported = Dump(*other);
  EXPECT_GT(imported.subjects.size(), 5U);
  EXPECT_TRUE(imported.application.empty());
  expected.subjects["Ranger"].parent.clear();
  for (const auto& [name, subject] : imported.subjects)
  {
    // Warnings depend on devices, which are not exported.
    SubjectDump known = expected.subjects.at(name);
    for (auto& [path, value] : known.entries)
      if (path.starts_with("Warnings/"))
        value = subject.entries.at(path);
    EXPECT_TRUE(subject == known) << name;
  }
  EXPECT_EQ(imported.subjects.at("Left glove").slot, "LeftHand");
  EXPECT_EQ(imported.subjects.at("Crate").parent, "Left glove");

  // A single object leaves its character.
  ASSERT_TRUE(io.ExportSubject(Find("Left glove"), Wide(file), reason).Succeeded());
  const auto empty = NMX::MakeShared<Store::VStore>();
  ASSERT_TRUE(FileIO::VRunaCoreFileIO(empty).ImportSubject(Wide(file), false, reason).Succeeded()) << reason;
  EXPECT_EQ(Dump(*empty).subjects.at("Left glove").parent, "");
}

TEST_F(SubjectFilesTest, ImportingOverwritesOnlyWhenItIsToldToAndThenAllOrNothing)
{
  const Id cart = Add(ESubjectKind::Props, "Cart");
  Set(Add(ESubjectKind::BasicObjects, "Crate"), Paths::ParentSubjectId(), cart);
  ASSERT_TRUE(io.ExportSubject(cart, Wide(file), reason).Succeeded());
  Set(Find("Crate"), Paths::Enabled(), false);
  Set(Add(ESubjectKind::BasicObjects, "Lamp"), Paths::ParentSubjectId(), cart);
  const StoreDump before = Dump(*store);

  EXPECT_EQ(io.ImportSubject(Wide(file), false, reason), IResult(EResult::AlreadyPresent));
  EXPECT_THAT(reason, testing::EndsWith("a.xml:4:5: there is a subject \"Cart\" already"));
  EXPECT_TRUE(Dump(*store) == before);
  archive.full = true;
  EXPECT_EQ(io.ImportSubject(Wide(file), true, reason), IResult(EResult::DiskFull));
  archive.full = false;
  // It fails after the present subjects have been removed.
  const auto wrong = Write("wrong.xml", "<SubjectConfiguration version='1'><Subjects><Subject kind='Props' "
                                        "name='Cart'/><Subject kind='Props' name='Crate' parent='Nobody'/></Subjects>"
                                        "</SubjectConfiguration>");
  EXPECT_EQ(io.ImportSubject(Wide(wrong), true, reason), IResult(EResult::SerialisationFailure));
  EXPECT_TRUE(Dump(*store) == before);

  EXPECT_EQ(io.ImportSubject(Wide(file), true, reason), IResult(EResult::Ok)) << reason;
  EXPECT_TRUE(Get<bool>(Find("Crate"), Paths::Enabled()));
  EXPECT_NE(Find("Cart"), cart);
  EXPECT_EQ(Get<Id>(Find("Crate"), Paths::ParentSubjectId()), Find("Cart"));
  EXPECT_EQ(Get<Id>(Find("Lamp"), Paths::ParentSubjectId()), Id{}) << "it was not in the file";
}

}
