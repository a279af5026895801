#include "StandaloneHost/Store/SqliteArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "StoreInterface/EntryPaths.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>
#include <sqlite3.h>

#include <fstream>
#include <iterator>

using NMX::ESubjectKind;
using NMX::TSubjectStoreId;
using testing::AllOf;
using testing::HasSubstr;
namespace Paths = NMX::Paths;

namespace
{

class ArchiveTest : public testing::Test
{
protected:
  [[nodiscard]] std::shared_ptr<Store::VStore> Open() const
  {
    return NMX::MakeShared<Store::VStore>(std::make_unique<Store::SqliteArchive>(file));
  }

  /// Why the archive cannot be opened.
  [[nodiscard]] std::string Refusal() const
  {
    try
    {
      (void)Open();
    }
    catch (const Store::ArchiveError& failure)
    {
      return failure.what();
    }
    return "opened";
  }

  [[nodiscard]] std::string Bytes() const
  {
    std::ifstream in(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), {}};
  }

  void Execute(const char* text) const
  {
    sqlite3* database = nullptr;
    ASSERT_EQ(sqlite3_open(file.c_str(), &database), SQLITE_OK);
    EXPECT_EQ(sqlite3_exec(database, text, nullptr, nullptr, nullptr), SQLITE_OK) << sqlite3_errmsg(database);
    sqlite3_close(database);
  }

  TemporaryFolder folder;
  std::filesystem::path file = folder.Path() / "store.sqlite";
};

}

TEST_F(ArchiveTest, KeepsEveryTypeOfValueExactly)
{
  TSubjectStoreId glove, ada, body, deleted;
  const std::vector<std::pair<NMX::EntryPath, NMX::Value>> gloveValues{
      {Paths::Enabled(), false},
      {Paths::PresetName(), std::string("Left \"hand\"\n\xC3\xA9")},
      {Paths::ColourRGBA(), NMX::Colour{1, 2, 3, 4}},
      {Paths::AdditionalMarkerPositions(),
       std::vector<NMX::Position>{{0.1, -2.5e-7, 1e300}, {234.20657862927774, -0.0, 5e-324}, {}}},
      {Paths::SmartClusters(), std::vector<NMX::SmartCluster>{{"A", "urn:1", 4294967295U, "Corvex1"}, {}}},
      {NMX::EntryPath("Warnings/WarningBatteryLow"), true},
      {Paths::Flags(), 0x43U}};
  const std::vector<std::pair<NMX::EntryPath, NMX::Value>> adaValues{
      {Paths::Calibration(), -7},
      {Paths::Retarget(), std::wstring(L"/caf\u00e9/\U0001F600.file")},
      {Paths::ReloadRetargetAction(), NMX::Action{2, "not now"}},
      {Paths::Slots(), std::vector<NMX::Slot>{{TSubjectStoreId(1), "Hand"}, {TSubjectStoreId(2), ""}}}};
  const std::vector<std::pair<NMX::EntryPath, NMX::Value>> application{
      {NMX::EntryPath("Application/Test/Wide"), std::wstring(L"\u00fc")},
      {NMX::EntryPath("Application/Test/Number"), 18446744073709551615ULL},
      {NMX::EntryPath("Application/Test/Real"), 0.1},
      {NMX::EntryPath("Application/Test/Ids"), std::vector<TSubjectStoreId>{TSubjectStoreId(3)}},
      {NMX::EntryPath("Application/Test/Option"), NMX::Option{L"/b", {{"A", L"/a"}, {"B", L"/b"}}}}};
  {
    const auto store = Open();
    const auto editor = store->Editor();
    ASSERT_TRUE(editor->Add(ESubjectKind::SmartObjects, "Glove", glove).Succeeded());
    ASSERT_TRUE(editor->Add(ESubjectKind::CharactersFromClusters, "Ada", ada).Succeeded());
    ASSERT_TRUE(editor->Add(ESubjectKind::GeneralSubjects, "Body", body).Succeeded());
    ASSERT_TRUE(editor->Add(ESubjectKind::Props, "Deleted", deleted).Succeeded());
    for (const auto& [path, value] : gloveValues)
      EXPECT_TRUE(editor->SetValue(glove, path, value).Succeeded()) << path;
    for (const auto& [path, value] : adaValues)
      EXPECT_TRUE(editor->SetValue(ada, path, value).Succeeded()) << path;
    for (const auto& [path, value] : application)
      EXPECT_TRUE(editor->SetApplicationEntry(path, value).Succeeded()) << path;
    EXPECT_TRUE(editor->SetValue(glove, Paths::ParentSubjectId(), ada).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
    const auto second = store->Editor();
    EXPECT_TRUE(second->Remove(deleted).Succeeded());
    EXPECT_TRUE(second->Commit().Succeeded());
  }
  const auto store = Open();
  auto reader = store->Reader();
  const auto check = [&](TSubjectStoreId id, const auto& values)
  {
    for (const auto& [path, expected] : values)
    {
      const NMX::Value* value = nullptr;
      EXPECT_TRUE(reader->Find(id, path, value).Succeeded());
      ASSERT_NE(value, nullptr) << path;
      EXPECT_EQ(*value, expected) << path;
    }
  };
  check(glove, gloveValues);
  check(ada, adaValues);
  for (const auto& [path, expected] : application)
  {
    ASSERT_NE(reader->FindApplicationEntry(path), nullptr) << path;
    EXPECT_EQ(*reader->FindApplicationEntry(path), expected) << path;
  }
  std::vector<TSubjectStoreId> children;
  EXPECT_TRUE(reader->Children(ada, children).Succeeded());
  EXPECT_THAT(children, testing::ElementsAre(glove));

  reader.reset();
  TSubjectStoreId next;
  EXPECT_TRUE(store->Editor()->Add(ESubjectKind::Props, "Next", next).Succeeded());
  EXPECT_GT(next, deleted) << "an id is never used again";
}

TEST_F(ArchiveTest, RefusesFilesThatItCannotUseAndLeavesThemAsTheyAre)
{
  std::ofstream(file) << std::string(5000, 'x');
  std::string before = Bytes();
  EXPECT_THAT(Refusal(), AllOf(HasSubstr(file.string()), HasSubstr("damaged, or not a store")));
  EXPECT_EQ(Bytes(), before);
  std::filesystem::remove(file);

  Execute("CREATE TABLE recipes(name TEXT)");
  before = Bytes();
  EXPECT_THAT(Refusal(), HasSubstr("belongs to another program"));
  EXPECT_EQ(Bytes(), before);
  std::filesystem::remove(file);

  (void)Open();
  Execute("PRAGMA user_version = 3");
  EXPECT_THAT(Refusal(), HasSubstr("written by a later version"));
  Execute("PRAGMA user_version = 1; INSERT INTO application VALUES('Application/Old', '[5,0.25]')");
  {
    const auto store = Open();
    const NMX::Value* old = store->Reader()->FindApplicationEntry(NMX::EntryPath("Application/Old"));
    ASSERT_NE(old, nullptr);
    EXPECT_EQ(*old, NMX::Value(0.25)) << "as numbers were kept once";
  }
  Execute("DELETE FROM application");

  const struct
  {
    const char* damage;
    const char* complaint;
  } damages[] = {
      {"INSERT INTO subject VALUES(1, 'Nonsense', 'A', '{}')", "subject 1 cannot be read: unknown kind \"Nonsense\""},
      {"UPDATE subject SET kind = 'Props', entries = '{'", "subject 1 cannot be read"},
      {"UPDATE subject SET entries = '{\"Parameters/Enabled\":1}'", "subject 1 cannot be read"},
      {"UPDATE subject SET entries = '{\"ParentSubjectId\":9}'", "has no parent 9"},
      {"UPDATE subject SET entries = '{}'", "its id counter is behind"},
      {"UPDATE counter SET nextSubjectId = 2", "opened"},
      {"INSERT INTO application VALUES('A', '[200,1]')", "entry \"A\" cannot be read"}};
  for (const auto& [damage, complaint] : damages)
  {
    Execute(damage);
    EXPECT_THAT(Refusal(), HasSubstr(complaint)) << damage;
  }
}

TEST_F(ArchiveTest, HoldsTheFileAlone)
{
  const auto store = Open();
  EXPECT_THAT(Refusal(), HasSubstr("another process has it open"));
}
