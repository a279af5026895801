#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/VCharacterFromClustersServices.h"
#include "RunaCorePluginSubjectStore/Subjects/Slots.h"
#include "StandaloneHost/Store/SqliteArchive.h"
#include "tests/Support/StoreFixture.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <array>
#include <map>
#include <optional>
#include <random>
#include <set>

using NMX::ESubjectKind;
using Id = NMX::TSubjectStoreId;
using testing::ElementsAre;
using testing::IsEmpty;
namespace Paths = NMX::Paths;

namespace
{

using Warnings = std::set<std::string>;

Warnings WarningsOf(const NMX::IStoreReader& reader, Id character)
{
  static const std::array derived{Paths::WarningEmptySlot(), Paths::WarningCFCChildWarning(),
                                  Paths::WarningNotCalibrated(), Paths::WarningCFCNoReferenceClusterAssigned(),
                                  Paths::WarningInsufficientAutoAssignCandidates()};
  Warnings warnings;
  for (const NMX::EntryPath& path : derived)
  {
    bool holds = false;
    EXPECT_TRUE(NMX::Read(reader, character, path, holds).Succeeded());
    if (holds)
      warnings.emplace(path.Text().substr(std::string_view("Warnings/Warning").size()));
  }
  return warnings;
}

/// What an object says of its place.
struct Place
{
  Id character;
  Id slot;
  std::string name; ///< the auto-assigned one; empty when it has none

  friend bool operator==(const Place&, const Place&) = default;
};

Place PlaceOf(const NMX::IStoreReader& reader, Id object)
{
  Place place;
  EXPECT_TRUE(NMX::Read(reader, object, Paths::ParentSubjectId(), place.character).Succeeded());
  EXPECT_TRUE(NMX::Read(reader, object, Paths::ParentSubjectSlotId(), place.slot).Succeeded());
  const NMX::IResult named = NMX::Read(reader, object, Paths::AutoAssignedName(), place.name);
  EXPECT_TRUE(named.Succeeded() ? !place.name.empty() : named == NMX::EResult::NotSet) << named.Name();
  return place;
}

/// The slots of a character, numbered from 1 and named "Slot 1", ...
std::vector<NMX::Slot> NumberedSlots(std::size_t count)
{
  std::vector<NMX::Slot> slots;
  while (slots.size() < count)
    slots.push_back({Id(slots.size() + 1), "Slot " + std::to_string(slots.size() + 1)});
  return slots;
}

class CharacterSlotsTest : public StoreFixture
{
protected:
  Id AddObject(const char* name, bool autoAssign, ESubjectKind kind = ESubjectKind::BasicObjects)
  {
    Id id;
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          EXPECT_TRUE(editor.Add(kind, name, id).Succeeded());
          EXPECT_TRUE(editor.SetValue(id, Paths::AutoAssignEnabled(), autoAssign).Succeeded());
        });
    return id;
  }

  Id AddCharacter(const char* name, std::size_t slots)
  {
    Id id;
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          EXPECT_TRUE(editor.Add(ESubjectKind::CharactersFromClusters, name, id).Succeeded());
          EXPECT_TRUE(editor.SetValue(id, Paths::Slots(), NumberedSlots(slots)).Succeeded());
        });
    return id;
  }

  void Fill(Id character, int slot, Id object)
  {
    Change([&](NMX::IEntryEditor& editor)
           { EXPECT_TRUE(Subjects::FillSlot(editor, character, Id(slot), object).Succeeded()); });
  }

  Place PlaceOf(Id object) const { return ::PlaceOf(*store->Reader(), object); }
  Warnings WarningsOf(Id character) const { return ::WarningsOf(*store->Reader(), character); }
};

const Place nowhere{};

}

TEST_F(CharacterSlotsTest, WarningsComeAndGoWithWhatCausesThem)
{
  const Warnings fresh{"CFCNoReferenceClusterAssigned", "EmptySlot", "InsufficientAutoAssignCandidates",
                       "NotCalibrated"};
  const Id ada = AddCharacter("Ada", 2);
  EXPECT_EQ(WarningsOf(ada), fresh);
  const Id belt = AddObject("Belt", false);
  Fill(ada, 1, belt);
  EXPECT_EQ(WarningsOf(ada), (Warnings{"EmptySlot", "InsufficientAutoAssignCandidates", "NotCalibrated"}));
  Set(ada, Paths::Enabled(), false);
  EXPECT_EQ(WarningsOf(ada), (Warnings{"EmptySlot", "NotCalibrated"}));
  Set(ada, Paths::Enabled(), true);
  Set(ada, Paths::Calibration(), 1);
  EXPECT_TRUE(WarningsOf(ada).contains("NotCalibrated"));
  Set(ada, Paths::Calibration(), 2);
  const Id glove = AddObject("Glove", true, ESubjectKind::SmartObjects);
  EXPECT_EQ(PlaceOf(glove), (Place{ada, Id(2), "Slot 2"}));
  EXPECT_THAT(WarningsOf(ada), IsEmpty());
  Set(glove, Paths::WarningObjectConfusion(), true);
  EXPECT_EQ(WarningsOf(ada), Warnings{"CFCChildWarning"});
  Set(glove, Paths::WarningObjectConfusion(), false);
  Set(belt, Paths::AutoAssignEnabled(), true);
  EXPECT_EQ(WarningsOf(ada), Warnings{"CFCNoReferenceClusterAssigned"});
  EXPECT_EQ(PlaceOf(belt), (Place{ada, Id(1), "Slot 1"}));
  Set(belt, Paths::AutoAssignEnabled(), false);
  EXPECT_EQ(PlaceOf(belt), (Place{ada, Id(1), ""}));
  Remove(glove);
  EXPECT_EQ(WarningsOf(ada), (Warnings{"EmptySlot", "InsufficientAutoAssignCandidates"}));
  Set(ada, Paths::WarningEmptySlot(), false);
  EXPECT_TRUE(WarningsOf(ada).contains("EmptySlot")) << "what somebody else writes does not last";
}

TEST_F(CharacterSlotsTest, EmptySlotsAreFilledInTheOrderOfCharactersSlotsAndObjects)
{
  const Id ada = AddCharacter("Ada", 2);
  const Id ben = AddCharacter("Ben", 2);
  Set(ada, Paths::Enabled(), false);
  const Id manual = AddObject("Manual", false);
  const Id first = AddObject("First", true);
  const Id second = AddObject("Second", true);
  const Id third = AddObject("Third", true);
  EXPECT_EQ(PlaceOf(first), (Place{ben, Id(1), "Slot 1"}));
  EXPECT_EQ(PlaceOf(second), (Place{ben, Id(2), "Slot 2"}));
  EXPECT_EQ(PlaceOf(third), nowhere);
  // Two characters and two objects become available with one edit.
  Change(
      [&](NMX::IEntryEditor& editor)
      {
        EXPECT_TRUE(editor.Remove(first).Succeeded());
        EXPECT_TRUE(editor.SetValue(manual, Paths::AutoAssignEnabled(), true).Succeeded());
        EXPECT_TRUE(editor.SetValue(ada, Paths::Enabled(), true).Succeeded());
      });
  EXPECT_EQ(PlaceOf(manual), (Place{ada, Id(1), "Slot 1"}));
  EXPECT_EQ(PlaceOf(third), (Place{ada, Id(2), "Slot 2"}));
  EXPECT_EQ(PlaceOf(second), (Place{ben, Id(2), "Slot 2"})) << "what is in a slot stays there";
  EXPECT_EQ(WarningsOf(ben), (Warnings{"CFCNoReferenceClusterAssigned", "EmptySlot", "InsufficientAutoAssignCandidates",
                                       "NotCalibrated"}));
  // What a removed character leaves goes on to the next.
  Remove(ada);
  EXPECT_EQ(PlaceOf(manual), (Place{ben, Id(1), "Slot 1"}));
  EXPECT_EQ(PlaceOf(third), nowhere);
  // An object that is somebody's child is not taken away.
  const Id prop = AddObject("Prop", false);
  Set(third, Paths::ParentSubjectId(), prop);
  Remove(manual);
  EXPECT_EQ(PlaceOf(third), (Place{prop, Id{}, ""}));
}

TEST_F(CharacterSlotsTest, WhatChangesInTheSameEditIsAssignedAsTheEditLeavesIt)
{
  const Id first = AddObject("First", true);
  const Id removed = AddObject("Removed", true);
  const Id manual = AddObject("Manual", true);
  const Id last = AddObject("Last", true);
  Id ada;
  Change(
      [&](NMX::IEntryEditor& editor)
      {
        EXPECT_TRUE(editor.Remove(removed).Succeeded());
        EXPECT_TRUE(editor.SetValue(manual, Paths::AutoAssignEnabled(), false).Succeeded());
        EXPECT_TRUE(editor.Add(ESubjectKind::CharactersFromClusters, "Ada", ada).Succeeded());
        EXPECT_TRUE(editor.SetValue(ada, Paths::Slots(), NumberedSlots(3)).Succeeded());
      });
  EXPECT_EQ(PlaceOf(first), (Place{ada, Id(1), "Slot 1"}));
  EXPECT_EQ(PlaceOf(last), (Place{ada, Id(2), "Slot 2"}));
  EXPECT_EQ(PlaceOf(manual), nowhere);
}

TEST_F(CharacterSlotsTest, ACharacterIsNotGivenWhatItIsBeneath)
{
  const Id cart = AddObject("Cart", false);
  const Id chair = AddObject("Chair", false);
  const Id ada = AddCharacter("Ada", 2);
  Set(chair, Paths::ParentSubjectId(), cart);
  Set(ada, Paths::ParentSubjectId(), chair);
  Set(cart, Paths::AutoAssignEnabled(), true);
  EXPECT_EQ(PlaceOf(cart), nowhere);
  const Id hat = AddObject("Hat", true);
  EXPECT_EQ(PlaceOf(hat), (Place{ada, Id(1), "Slot 1"})) << "others are assigned past it";
  EXPECT_EQ(PlaceOf(cart), nowhere);
  const Id ben = AddCharacter("Ben", 1);
  EXPECT_EQ(PlaceOf(cart), (Place{ben, Id(1), "Slot 1"}));
  Set(ada, Paths::Enabled(), false); // the store goes on
}

TEST_F(CharacterSlotsTest, NothingIsAssignedInAHostWithoutAutoAssignment)
{
  store = NMX::MakeShared<Store::VStore>(Store::DerivationRules{false});
  const Id ada = AddCharacter("Ada", 2);
  const Id glove = AddObject("Glove", true);
  EXPECT_EQ(PlaceOf(glove), nowhere);
  EXPECT_EQ(WarningsOf(ada), (Warnings{"EmptySlot", "NotCalibrated"}));
  Fill(ada, 2, glove);
  EXPECT_EQ(PlaceOf(glove), (Place{ada, Id(2), ""}));
}

TEST_F(CharacterSlotsTest, ASlotThatIsTakenOrDoesNotExistIsNobodys)
{
  const Id ada = AddCharacter("Ada", 2);
  const Id first = AddObject("First", false);
  const Id second = AddObject("Second", false);
  Fill(ada, 1, first);
  const auto claim = [&](Id object, Id parent, int slot)
  {
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          EXPECT_TRUE(editor.SetValue(object, Paths::ParentSubjectId(), parent).Succeeded());
          EXPECT_TRUE(editor.SetValue(object, Paths::ParentSubjectSlotId(), Id(slot)).Succeeded());
        });
    return PlaceOf(object);
  };
  EXPECT_EQ(claim(second, ada, 1), (Place{ada, Id{}, ""}));
  EXPECT_EQ(claim(second, ada, 3), (Place{ada, Id{}, ""}));
  EXPECT_EQ(claim(second, first, 1), (Place{first, Id{}, ""}));
  EXPECT_EQ(claim(second, Id{}, 1), nowhere);
  EXPECT_EQ(claim(second, ada, 2), (Place{ada, Id(2), ""}));
  // Its slot goes with the character's parent, and with the slot itself.
  Set(second, Paths::ParentSubjectId(), first);
  EXPECT_EQ(PlaceOf(second), (Place{first, Id{}, ""}));
  Set(ada, Paths::Slots(), std::vector<NMX::Slot>{{Id(2), "Other"}, {Id(2), "Twice"}, {Id{}, "No id"}});
  EXPECT_EQ(PlaceOf(first), (Place{ada, Id{}, ""}));
  EXPECT_TRUE(WarningsOf(ada).contains("CFCNoReferenceClusterAssigned")) << "a child in no slot is no reference";
  EXPECT_EQ(claim(second, ada, 2), (Place{ada, Id(2), ""}));
  EXPECT_FALSE(WarningsOf(ada).contains("EmptySlot"));
}

TEST_F(CharacterSlotsTest, AStoreThatWasWrittenUnderOtherRulesIsBroughtUpToDate)
{
  const TemporaryFolder folder;
  const auto open = [&](bool autoAssign)
  {
    store = nullptr;
    store = NMX::MakeShared<Store::VStore>(std::make_unique<Store::SqliteArchive>(folder.Path() / "store.sqlite"),
                                           Store::DerivationRules{autoAssign});
  };
  open(false);
  const Id ada = AddCharacter("Ada", 1);
  const Id glove = AddObject("Glove", true);
  open(true);
  const Place taken{ada, Id(1), "Slot 1"};
  EXPECT_EQ(PlaceOf(glove), taken);
  EXPECT_EQ(WarningsOf(ada), (Warnings{"CFCNoReferenceClusterAssigned", "NotCalibrated"}));
  open(false);
  EXPECT_EQ(PlaceOf(glove), (Place{ada, Id(1), ""})) << "the assignment was kept";
}

namespace
{

/// What must hold of characters and objects, kept in the plainest way there is.
struct PlainObject
{
  std::string name;
  bool autoAssign = false;
  bool confused = false;
  std::optional<std::pair<Id, std::size_t>> place; ///< character and index of the slot
};

struct PlainCharacter
{
  std::string name;
  bool enabled = true;
  std::int32_t calibration = 0;
};

/// Drives the character services, and the model beside them.
class RandomStage
{
public:
  static constexpr std::size_t characterCount = 50;
  static constexpr std::size_t slotCount = 20;
  static constexpr std::size_t objectCount = 1300;

  explicit RandomStage(unsigned seed) : m_random(seed) {}

  void Step(const std::shared_ptr<NMX::IStore>& store)
  {
    using Service = CharacterFromClustersServices::VCharacterFromClustersServices;
    const auto service = NMX::MakeShared<Service>(nullptr, store);
    if (m_characters.size() < characterCount)
      return AddCharacter(*store);
    if (m_objects.size() < objectCount)
      return AddObject(*store);
    const Id character = Any(m_characters);
    const Id object = Any(m_objects);
    switch (Below(36))
    {
    case 0:
      EXPECT_TRUE(service->RemoveCharacter(m_characters[character].name).Succeeded());
      for (auto& [id, plain] : m_objects)
        if (plain.place && plain.place->first == character)
          plain.place.reset();
      m_characters.erase(character);
      break;
    case 1:
      Edit(*store, [&](NMX::IEntryEditor& editor) { return editor.Remove(object); });
      m_objects.erase(object);
      break;
    case 2:
      m_characters[character].name = "Character " + std::to_string(++m_names);
      Edit(*store, [&](NMX::IEntryEditor& editor)
           { return editor.Rename(character, m_characters[character].name, NMX::ENotify::Yes); });
      break;
    case 3:
      m_objects[object].name = "Object " + std::to_string(++m_names);
      Edit(*store,
           [&](NMX::IEntryEditor& editor) { return editor.Rename(object, m_objects[object].name, NMX::ENotify::Yes); });
      break;
    case 4:
      m_characters[character].enabled = Below(2) != 0;
      EXPECT_TRUE(
          service->SetCharacterEnabled(m_characters[character].name, m_characters[character].enabled).Succeeded());
      break;
    case 5:
      m_characters[character].calibration = Below(3);
      SetValue(*store, character, Paths::Calibration(), m_characters[character].calibration);
      break;
    case 6:
      m_objects[object].autoAssign = Below(2) == 0;
      SetValue(*store, object, Paths::AutoAssignEnabled(), m_objects[object].autoAssign);
      break;
    case 7:
      m_objects[object].confused = Below(4) == 0;
      SetValue(*store, object, Paths::WarningObjectConfusion(), m_objects[object].confused);
      break;
    default:
      return SetSlotObject(*service, character, object);
    }
    FillSlots();
  }

  /// The store holds what the model holds.
  void Check(const std::shared_ptr<NMX::IStore>& store)
  {
    const auto reader = store->Reader();
    std::map<std::pair<Id, std::size_t>, Id> occupants;
    for (const auto& [id, plain] : m_objects)
    {
      Place expected;
      if (plain.place)
      {
        ASSERT_TRUE(occupants.emplace(*plain.place, id).second);
        const std::string slot = "Slot " + std::to_string(plain.place->second + 1);
        expected = {plain.place->first, Id(plain.place->second + 1), plain.autoAssign ? slot : ""};
      }
      ASSERT_EQ(::PlaceOf(*reader, id), expected) << plain.name;
      Id found;
      ASSERT_TRUE(reader->FindByName(plain.name, found).Succeeded());
      ASSERT_EQ(found, id);
    }
    for (const auto& [id, plain] : m_characters)
    {
      Warnings expected;
      bool empty = false, warned = false, referenced = false;
      std::vector<Id> children;
      for (std::size_t slot = 0; slot < slotCount; ++slot)
      {
        const auto occupant = occupants.find({id, slot});
        empty = empty || occupant == occupants.end();
        if (occupant == occupants.end())
          continue;
        children.push_back(occupant->second);
        warned = warned || m_objects[occupant->second].confused;
        referenced = referenced || !m_objects[occupant->second].autoAssign;
      }
      const auto expect = [&](const char* warning, bool holds)
      {
        if (holds)
          expected.insert(warning);
      };
      expect("EmptySlot", empty);
      expect("CFCChildWarning", warned);
      expect("NotCalibrated", plain.calibration != 2);
      expect("CFCNoReferenceClusterAssigned", !referenced);
      expect("InsufficientAutoAssignCandidates", plain.enabled && empty);
      ASSERT_EQ(::WarningsOf(*reader, id), expected) << plain.name;
      std::vector<Id> held;
      ASSERT_TRUE(reader->Children(id, held).Succeeded());
      std::sort(children.begin(), children.end());
      ASSERT_EQ(held, children) << plain.name;
    }
  }

  [[nodiscard]] std::size_t FilledSlots() const
  {
    return static_cast<std::size_t>(std::count_if(m_objects.begin(), m_objects.end(),
                                                  [](const auto& each) { return each.second.place.has_value(); }));
  }

private:
  int Below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }

  template <class Plain>
  Id Any(const std::map<Id, Plain>& all)
  {
    return std::next(all.begin(), Below(static_cast<int>(all.size())))->first;
  }

  template <class Make>
  static void Edit(NMX::IStore& store, Make make)
  {
    const auto editor = store.Editor();
    EXPECT_TRUE(make(*editor).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
  }

  static void SetValue(NMX::IStore& store, Id id, NMX::EntryPath path, NMX::Value value)
  {
    Edit(store, [&](NMX::IEntryEditor& editor) { return editor.SetValue(id, path, std::move(value)); });
  }

  void AddCharacter(NMX::IStore& store)
  {
    const std::string name = "Character " + std::to_string(++m_names);
    Id id;
    Edit(store,
         [&](NMX::IEntryEditor& editor)
         {
           EXPECT_TRUE(editor.Add(ESubjectKind::CharactersFromClusters, name, id).Succeeded());
           return editor.SetValue(id, Paths::Slots(), NumberedSlots(slotCount));
         });
    m_characters[id] = {name};
    FillSlots();
  }

  void AddObject(NMX::IStore& store)
  {
    const std::string name = "Object " + std::to_string(++m_names);
    Id id;
    Edit(store, [&](NMX::IEntryEditor& editor)
         { return editor.Add(Below(2) != 0 ? ESubjectKind::BasicObjects : ESubjectKind::SmartObjects, name, id); });
    m_objects[id] = {name, false, false, {}};
  }

  void SetSlotObject(NMX::ICharacterFromClustersServices& service, Id character, Id object)
  {
    const auto slot = static_cast<std::size_t>(Below(slotCount));
    const bool clear = Below(5) == 0;
    const auto result = service.SetSlotObject(m_characters[character].name, static_cast<std::uint32_t>(slot),
                                              clear ? "" : m_objects[object].name);
    EXPECT_TRUE(result.Succeeded());
    for (auto& [id, plain] : m_objects)
      if (plain.place == std::pair(character, slot))
        plain.place.reset();
    if (!clear)
      m_objects[object].place = {character, slot};
    FillSlots();
    std::string shown;
    EXPECT_TRUE(service.SlotObject(m_characters[character].name, static_cast<std::uint32_t>(slot), shown).Succeeded());
    std::string expected;
    for (auto& [id, plain] : m_objects)
      if (plain.place == std::pair(character, slot))
        expected = plain.name;
    EXPECT_EQ(shown, expected);
  }

  void FillSlots()
  {
    std::set<std::pair<Id, std::size_t>> filled;
    for (const auto& [id, plain] : m_objects)
      if (plain.place)
        filled.insert(*plain.place);
    auto object = m_objects.begin();
    for (const auto& [id, plain] : m_characters)
      for (std::size_t slot = 0; plain.enabled && slot < slotCount; ++slot)
      {
        if (filled.contains({id, slot}))
          continue;
        while (object != m_objects.end() && (object->second.place || !object->second.autoAssign))
          ++object;
        if (object != m_objects.end())
          object->second.place = {id, slot};
      }
  }

  std::mt19937 m_random;
  std::map<Id, PlainCharacter> m_characters;
  std::map<Id, PlainObject> m_objects;
  int m_names = 0;
};

}

TEST(CharacterSlotsProperty, RandomAssignmentsNeverDivergeFromAPlainModelAndSurviveReopening)
{
  const TemporaryFolder folder;
  RandomStage stage(20261121);
  for (int session = 0; session < 3; ++session)
  {
    const auto store =
        NMX::MakeShared<Store::VStore>(std::make_unique<Store::SqliteArchive>(folder.Path() / "store.sqlite"));
    stage.Check(store);
    for (int step = 0; step < 4000; ++step)
    {
      stage.Step(store);
      if (step % 50 == 0)
        stage.Check(store);
      if (testing::Test::HasFailure())
        FAIL() << "session " << session << ", step " << step;
    }
  }
  EXPECT_GT(stage.FilledSlots(), RandomStage::slotCount * RandomStage::characterCount / 4);
}
