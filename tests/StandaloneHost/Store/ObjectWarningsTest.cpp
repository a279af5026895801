#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

#include <array>
#include <map>
#include <optional>
#include <random>
#include <set>
#include <utility>

using NMX::ESubjectKind;
using Id = NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

constexpr std::array derived{"DuplicateDevice",
                             "DuplicatePattern",
                             "NoPattern",
                             "DisconnectedDevice",
                             "MissingDevice",
                             "DeviceNotLinked",
                             "ActiveMarkersOff",
                             "ProximityGroupMissingUnique",
                             "ProximityGroupDuplicateTemplates",
                             "TemplateGroupNoProximityGroup",
                             "TemplateGroupNonIdentical",
                             "TemplateGroupProcessingNotEnabled"};

using Warnings = std::set<std::string>;

class ObjectWarningsTest : public StoreFixture
{
protected:
  Id Add(const char* name, ESubjectKind kind = ESubjectKind::SmartObjects) { return StoreFixture::Add(kind, name); }

  void SetClusters(Id id, std::vector<NMX::SmartCluster> clusters)
  {
    Set(id, Paths::SmartClusters(), std::move(clusters));
  }

  /// A device of the stage; none when `connected` is not given.
  void SetDevice(const std::string& urn, std::optional<bool> connected, bool charging = false)
  {
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          const auto set = [&](const char* entry, NMX::Value value)
          {
            const NMX::EntryPath path("Application/Devices/" + urn + "/" + entry);
            EXPECT_TRUE(editor.SetApplicationEntry(path, connected ? std::move(value) : NMX::Value{}).Succeeded());
          };
          set("Type", std::string("Corvex1"));
          set("Connected", connected.value_or(false));
          set("Charging", charging);
        });
  }

  Warnings Of(Id id) const
  {
    Warnings warnings;
    const auto reader = store->Reader();
    for (const char* name : derived)
    {
      bool holds = false;
      EXPECT_TRUE(NMX::Read(*reader, id, NMX::EntryPath(std::string("Warnings/Warning") + name), holds).Succeeded());
      if (holds)
        warnings.insert(name);
    }
    return warnings;
  }
};

}

TEST_F(ObjectWarningsTest, DevicesAndPatternsRaiseAndClearTheirWarnings)
{
  const Id one = Add("One");
  const Id other = Add("Other");
  SetClusters(one, {{"A", "", 0, "Corvex1"}});
  EXPECT_EQ(Of(one), (Warnings{"DeviceNotLinked", "NoPattern"}));
  SetClusters(one, {{"A", "urn", 1, "Corvex1"}});
  EXPECT_EQ(Of(one), Warnings{"MissingDevice"});
  SetDevice("urn", false);
  EXPECT_EQ(Of(one), Warnings{"DisconnectedDevice"});
  SetDevice("urn", true, true);
  EXPECT_EQ(Of(one), Warnings{"ActiveMarkersOff"});
  Set(one, Paths::MarkersOnWhileCharging(), true);
  EXPECT_EQ(Of(one), Warnings{});

  SetClusters(other, {{"A", "urn", 1, "Corvex1"}, {"B", "urn", 2, "Corvex1"}});
  EXPECT_EQ(Of(one), (Warnings{"DuplicateDevice", "DuplicatePattern"}));
  EXPECT_EQ(Of(other), (Warnings{"DuplicateDevice", "DuplicatePattern", "ActiveMarkersOff"}));
  Set(other, Paths::Enabled(), false);
  EXPECT_EQ(Of(one), Warnings{"DuplicateDevice"});
  EXPECT_EQ(Of(other), (Warnings{"DuplicateDevice", "ActiveMarkersOff"}));
  SetClusters(other, {{"A", "urn", 0, "Quarex10"}});
  Set(other, Paths::Enabled(), true);
  EXPECT_EQ(Of(other), (Warnings{"DuplicateDevice", "ActiveMarkersOff", "NoPattern"}));
  SetClusters(other, {{"A", "else", 1, "Quarex10"}});
  EXPECT_EQ(Of(one), Warnings{}) << "patterns of another type of device are other patterns";
  SetDevice("urn", std::nullopt);
  EXPECT_EQ(Of(one), Warnings{"MissingDevice"});
  Change([&](NMX::IEntryEditor& editor) { EXPECT_TRUE(editor.Remove(one).Succeeded()); });

  // What is derived cannot be written.
  Set(other, NMX::EntryPath("Warnings/WarningNoPattern"), true);
  EXPECT_EQ(Of(other), Warnings{"MissingDevice"});
}

TEST_F(ObjectWarningsTest, GroupsOfObjectsOfBothKindsRaiseAndClearTheirWarnings)
{
  const Id shield = Add("Shield", ESubjectKind::BasicObjects);
  const Id twin = Add("Twin", ESubjectKind::BasicObjects);
  const Id sword = Add("Sword");
  for (const Id id : {shield, twin})
    Set(id, Paths::TemplateGroupName(), std::string("Shields"));
  EXPECT_EQ(Of(shield), Warnings{"TemplateGroupNoProximityGroup"});
  for (const Id id : {shield, twin})
    Set(id, Paths::ProximityGroupName(), std::string("Guard"));
  EXPECT_EQ(Of(twin), (Warnings{"ProximityGroupMissingUnique", "ProximityGroupDuplicateTemplates"}));
  Set(sword, Paths::ProximityGroupName(), std::string("Guard"));
  EXPECT_EQ(Of(twin), Warnings{"ProximityGroupDuplicateTemplates"});
  EXPECT_EQ(Of(sword), Warnings{"ProximityGroupDuplicateTemplates"});
  Set(twin, Paths::ProximityGroupName(), std::string("Watch"));
  EXPECT_EQ(Of(shield), Warnings{});
  EXPECT_EQ(Of(twin), Warnings{"ProximityGroupMissingUnique"});
  Set(sword, Paths::Enabled(), false);
  EXPECT_EQ(Of(shield), Warnings{"ProximityGroupMissingUnique"}) << "the sword is not there to tell it by";
  EXPECT_EQ(Of(sword), Warnings{});
  Set(sword, Paths::Enabled(), true);

  Set(twin, Paths::Markers(), std::vector<NMX::Position>{{1, 2, 3}});
  EXPECT_EQ(Of(shield), Warnings{"TemplateGroupNonIdentical"});
  Set(shield, Paths::Markers(), std::vector<NMX::Position>{{1, 2, 3}});
  EXPECT_EQ(Of(shield), Warnings{});
  SetApplication("Application/Settings/Processing/ProximityGrouping", false);
  EXPECT_EQ(Of(shield), Warnings{"TemplateGroupProcessingNotEnabled"});
  EXPECT_EQ(Of(sword), Warnings{});
  SetApplication("Application/Settings/Processing/ObjectInstanceTracking", true);
  EXPECT_EQ(Of(shield), Warnings{});
}

TEST_F(ObjectWarningsTest, AnEditRewritesNobodyWhomItDoesNotTouch)
{
  const Id one = Add("One", ESubjectKind::BasicObjects);
  const Id other = Add("Other", ESubjectKind::BasicObjects);
  for (const Id id : {one, other})
    Set(id, Paths::TemplateGroupName(), std::string("Shields"));
  NMX::ChangeStamps before{};
  NMX::ChangeStamps after{};
  EXPECT_TRUE(store->Reader()->Stamps(other, before).Succeeded());
  Set(one, Paths::ColourRGBA(), NMX::Colour{1, 2, 3, 4});
  Set(one, Paths::Markers(), std::vector<NMX::Position>{{1, 2, 3}});
  Set(one, Paths::Markers(), std::vector<NMX::Position>{});
  EXPECT_TRUE(store->Reader()->Stamps(other, after).Succeeded());
  EXPECT_NE(before, after) << "it was not identical for a while";
  EXPECT_TRUE(store->Reader()->Stamps(other, before).Succeeded());
  Set(one, Paths::ColourRGBA(), NMX::Colour{4, 3, 2, 1});
  EXPECT_TRUE(store->Reader()->Stamps(other, after).Succeeded());
  EXPECT_EQ(before, after);
}

TEST_F(ObjectWarningsTest, AfterAnyEditsTheWarningsAreThoseOfAStoreThatWasMadeSo)
{
  std::mt19937 random(17);
  const auto pick = [&](auto... values)
  {
    const std::common_type_t<decltype(values)...> all[] = {values...};
    return all[random() % sizeof...(values)];
  };
  struct Object
  {
    ESubjectKind kind;
    std::map<NMX::EntryPath, NMX::Value> values;
  };
  std::map<std::string, Object> objects;
  std::map<std::string, bool> devices; // and whether they are charging
  for (int round = 0; round < 60; ++round)
  {
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          for (auto edits = random() % 6; edits-- > 0;)
          {
            const std::string name = "Object " + std::to_string(random() % 9);
            Id id;
            if (editor.FindByName(name, id).Failed())
            {
              const ESubjectKind kind = pick(ESubjectKind::BasicObjects, ESubjectKind::SmartObjects);
              EXPECT_TRUE(editor.Add(kind, name, id).Succeeded());
              objects[name] = {kind, {}};
            }
            else if (random() % 8 == 0)
            {
              EXPECT_TRUE(editor.Remove(id).Succeeded());
              objects.erase(name);
              continue;
            }
            const auto set = [&](NMX::EntryPath path, const NMX::Value& value)
            {
              if (editor.SetValue(id, path, value).Succeeded())
                objects[name].values[path] = value;
            };
            set(Paths::Enabled(), random() % 4 != 0);
            set(Paths::ProximityGroupName(), std::string(pick("", "P", "Q")));
            set(Paths::TemplateGroupName(), std::string(pick("", "", "T", "U")));
            set(Paths::Markers(), std::vector<NMX::Position>(random() % 2));
            std::vector<NMX::SmartCluster> clusters;
            for (auto count = random() % 3; count-- > 0;)
              clusters.push_back({"C", pick("", "a", "b", "c"), static_cast<std::uint32_t>(random() % 4),
                                  pick("Corvex1", "Quarex10")});
            set(Paths::SmartClusters(), std::move(clusters));
          }
        });
    const std::string urn = pick("a", "b");
    const bool there = random() % 3 != 0;
    SetDevice(urn, there ? std::optional(true) : std::nullopt, round % 2 == 0);
    devices.erase(urn);
    if (there)
      devices[urn] = round % 2 == 0;

    const auto edited = std::exchange(store, NMX::MakeShared<Store::VStore>());
    for (const auto& [device, charging] : devices)
      SetDevice(device, true, charging);
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          for (const auto& [name, object] : objects)
          {
            Id id;
            EXPECT_TRUE(editor.Add(object.kind, name, id).Succeeded());
            for (const auto& [path, value] : object.values)
              EXPECT_TRUE(editor.SetValue(id, path, value).Succeeded());
          }
        });
    for (const auto& [name, object] : objects)
    {
      Id id;
      EXPECT_TRUE(store->Reader()->FindByName(name, id).Succeeded());
      const Warnings wanted = Of(id);
      const auto fresh = std::exchange(store, edited);
      EXPECT_TRUE(store->Reader()->FindByName(name, id).Succeeded());
      ASSERT_EQ(Of(id), wanted) << name << " in round " << round;
      store = fresh;
    }
    store = edited;
  }
}
