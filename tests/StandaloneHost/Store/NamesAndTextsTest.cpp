#include "tests/Support/OldStore.h"
#include "tests/Support/StoreFixture.h"

#include <vector>

using NMX::EntryPath;
using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using NMX::TSubjectStoreId;
using namespace std::string_literals;
namespace Paths = NMX::Paths;

namespace
{

using Names = std::vector<std::string>;
using NamesAndTextsTest = StoreFixture;

TSubjectStoreId Find(const NMX::IStore& store, const std::string& name)
{
  TSubjectStoreId id;
  (void)store.Reader()->FindByName(name, id);
  return id;
}

const std::string composed = "caf\u00E9";
const std::string decomposed = "cafe\u0301";

}

TEST_F(NamesAndTextsTest, NamesThatCannotBeToldApartOrSeenAreNone)
{
  const Names unfit{".",         "..",       "\u00A0",       "\u3000\u2003", "\u00A0Box",     "Box\u2028",
                    "Box\u2009", "a\u0085b", "a\u009Fb",     "a\u2028b",     "a\u202Eb",      "a\u2066b",
                    "a\u2069b",  "a\u200Bb", "a\u200Db",     "a\u200Fb",     "a\uFEFFb",      "a\u00ADb",
                    "a\u2060b",  "a\uFE0Fb", "a\U000E0041b", "a\uFFFEb",     "a\xED\xA0\x80", "a\xFF",
                    "a\xC3",     "a\xC0\x80"};
  const Names fit{"...",
                  ".a",
                  "a.",
                  "a b",
                  "a\u00A0b",
                  "Gr\u00F6\u00DFe \u2264 5",
                  "\u7BB1 \U0001F9F0",
                  decomposed,
                  "\u05E9\u05DC\u05D5\u05DD",
                  "\u0639\u0631\u0628\u064A"};
  const auto editor = store->Editor();
  TSubjectStoreId id, box;
  ASSERT_TRUE(editor->Add(ESubjectKind::Props, "Box", box).Succeeded());
  for (const std::string& name : unfit)
  {
    EXPECT_EQ(editor->Add(ESubjectKind::Props, name, id), IResult(EResult::InvalidName)) << name;
    EXPECT_EQ(editor->Rename(box, name, NMX::ENotify::Yes), IResult(EResult::InvalidName)) << name;
  }
  for (const std::string& name : fit)
    EXPECT_EQ(editor->Add(ESubjectKind::Props, name, id), IResult(EResult::Ok)) << name;
}

TEST_F(NamesAndTextsTest, NamesThatAreEqualInNormalFormCAreOneNameKeptAsGiven)
{
  const std::string kelvin = "\u212A"; // its normal form is a plain K
  const std::pair<std::string, std::string> pairs[] = {
      {composed, decomposed}, {decomposed + "2", composed + "2"}, {"K", kelvin}, {kelvin + "elvin", "Kelvin"}};
  for (const auto& [given, other] : pairs)
  {
    const Id id = Add(ESubjectKind::Props, given);
    const auto expectFound = [&](const NMX::IStoreReader& access)
    {
      Id found;
      EXPECT_TRUE(access.FindByName(given, found).Succeeded() && found == id) << given;
      EXPECT_TRUE(access.FindByName(other, found).Succeeded() && found == id) << other;
    };
    expectFound(*store->Reader());
    EXPECT_EQ(Get<std::string>(id, Paths::Name()), given);
    const auto editor = store->Editor();
    Id added;
    EXPECT_EQ(editor->Add(ESubjectKind::Markerless, other, added), IResult(EResult::AlreadyPresent)) << other;
    ASSERT_TRUE(editor->Rename(id, "x", NMX::ENotify::Yes).Succeeded());
    EXPECT_EQ(editor->FindByName(other, added), IResult(EResult::NotFound)) << "it was renamed in this edit";
    ASSERT_TRUE(editor->Rename(id, given, NMX::ENotify::Yes).Succeeded());
    expectFound(*editor);
    EXPECT_EQ(editor->Rename(id, other, NMX::ENotify::Yes), IResult(EResult::Ok)) << "it is the subject's own";
    ASSERT_TRUE(editor->Commit().Succeeded());
    EXPECT_EQ(Get<std::string>(id, Paths::Name()), other);
    Change([&](NMX::IEntryEditor& remover) { EXPECT_TRUE(remover.Remove(id).Succeeded()); });
    Id found;
    EXPECT_EQ(store->Reader()->FindByName(given, found), IResult(EResult::NotFound));
  }
}

TEST(OldStore, NamesThatAreRefusedNowStayInReach)
{
  const Names names{".", "\u00A0", "a\u202Eb", composed, decomposed, " \u212A ", std::string(400, 'n')};
  const auto store = OpenOldStore(names, "");
  for (std::size_t i = 0; i < names.size(); ++i)
    EXPECT_EQ(Find(*store, names[i]), TSubjectStoreId(i + 1)) << names[i];
  const auto editor = store->Editor();
  EXPECT_EQ(editor->Rename(TSubjectStoreId(1), ".", NMX::ENotify::Yes), IResult(EResult::Ok)) << "it has that name";
  EXPECT_EQ(editor->Rename(TSubjectStoreId(1), "Dot", NMX::ENotify::Yes), IResult(EResult::Ok));
  EXPECT_EQ(editor->Rename(TSubjectStoreId(5), composed, NMX::ENotify::Yes), IResult(EResult::AlreadyPresent));
  EXPECT_EQ(editor->Remove(TSubjectStoreId(4)), IResult(EResult::Ok));
  EXPECT_EQ(editor->Rename(TSubjectStoreId(5), composed, NMX::ENotify::Yes), IResult(EResult::Ok));
  ASSERT_TRUE(editor->Commit().Succeeded());
  EXPECT_EQ(Find(*store, decomposed), TSubjectStoreId(5));
}

TEST_F(NamesAndTextsTest, TextsAndListsAreBounded)
{
  using Clusters = std::vector<NMX::SmartCluster>;
  using Slots = std::vector<NMX::Slot>;
  const std::string text(1024, 't');
  const std::string longer = text + 't';
  const std::wstring path(4096, L'p');
  const Id object = Add(ESubjectKind::SmartObjects, "Torch");
  const Id character = Add(ESubjectKind::CharactersFromClusters, "Ada");
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  const struct
  {
    Id id;
    EntryPath path;
    NMX::Value largest;
    std::vector<NMX::Value> refused;
  } entries[] = {
      {object, Paths::ProximityGroupName(), text, {longer, "a\xFF"s}},
      {object, Paths::TemplateGroupName(), std::string(1024, '\0'), {longer, "\xED\xA0\x80"s}},
      {object, Paths::SkinName(), text, {longer}},
      {crate, Paths::FilePath(), path, {path + L'p', std::wstring(2049, L'\u00E9'), std::wstring(1, wchar_t{0xD800})}},
      {object,
       Paths::SmartClusters(),
       Clusters(256, {text, text, 7, text}),
       {Clusters(257, {"a", "", 0, "T"}), Clusters{{longer, "", 0, "T"}}, Clusters{{"a", longer, 0, "T"}},
        Clusters{{"a", "", 0, longer}}, Clusters{{"a\xC3", "", 0, "T"}}}},
      {character, Paths::Slots(), Slots(256, {Id(1), text}), {Slots(257, {Id(1), "a"}), Slots{{Id(1), longer}}}},
      {crate, Paths::Markers(), std::vector<NMX::Position>(4096), {std::vector<NMX::Position>(4097)}}};
  for (const auto& entry : entries)
  {
    Set(entry.id, entry.path, entry.largest);
    for (const NMX::Value& value : entry.refused)
    {
      const auto editor = store->Editor();
      EXPECT_EQ(editor->SetValue(entry.id, entry.path, value), IResult(EResult::InvalidValue)) << entry.path;
      EXPECT_EQ(editor->Commit(), IResult(EResult::Ok));
    }
    const NMX::Value* kept = nullptr;
    const auto reader = store->Reader();
    EXPECT_TRUE(reader->Find(entry.id, entry.path, kept).Succeeded() && *kept == entry.largest) << entry.path;
  }
}

TEST_F(NamesAndTextsTest, ApplicationEntriesAreBounded)
{
  SetApplication("Application/Text", std::string(1024, 't'));
  const auto editor = store->Editor();
  EXPECT_EQ(editor->SetApplicationEntry(EntryPath("Application/Text"), std::string(1025, 't')),
            IResult(EResult::InvalidValue));
  EXPECT_EQ(editor->SetApplicationEntry(EntryPath("Application/" + std::string(4096, 'p')), 1),
            IResult(EResult::InvalidValue));
  EXPECT_EQ(editor->SetApplicationEntry(EntryPath("Application/\xFF"), 1), IResult(EResult::InvalidValue));
  IResult added;
  int count = 1;
  for (; count < 100000 && added.Succeeded(); ++count)
    added = editor->SetApplicationEntry(EntryPath("Application/Many/" + std::to_string(count)), 1);
  EXPECT_EQ(added, IResult(EResult::AllocationFailure));
  EXPECT_EQ(count, 65537) << "65,536 are in the store";
  EXPECT_EQ(editor->SetApplicationEntry(EntryPath("Application/Many/7"), 2), IResult(EResult::Ok));
  EXPECT_EQ(editor->SetApplicationEntry(EntryPath("Application/Many/8"), {}), IResult(EResult::Ok));
  EXPECT_EQ(editor->SetApplicationEntry(EntryPath("Application/Other"), 1), IResult(EResult::Ok));
}

TEST(OldStore, TextsThatAreTooLongStayUntilTheyAreReplaced)
{
  const std::string large(100000, 'g');
  const auto store = OpenOldStore({"Crate"}, large);
  const TSubjectStoreId crate = Find(*store, "Crate");
  const auto editor = store->Editor();
  EXPECT_EQ(editor->SetValue(crate, Paths::Enabled(), false), IResult(EResult::Ok));
  EXPECT_EQ(editor->SetValue(crate, Paths::ProximityGroupName(), large), IResult(EResult::Ok)) << "no change";
  EXPECT_EQ(editor->SetValue(crate, Paths::TemplateGroupName(), large), IResult(EResult::InvalidValue));
  EXPECT_EQ(editor->SetValue(crate, Paths::ProximityGroupName(), "Kegs"s), IResult(EResult::Ok));
  EXPECT_TRUE(editor->Commit().Succeeded());
}
