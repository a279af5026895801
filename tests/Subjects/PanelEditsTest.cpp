#include "RunaCorePluginSubjectStore/Subjects/ClusterEdits.h"
#include "RunaCorePluginSubjectStore/Subjects/SlotAssignment.h"
#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using testing::ElementsAre;
using testing::IsEmpty;
namespace Paths = NMX::Paths;

namespace
{

class PanelEditsTest : public StoreFixture
{
protected:
  using Clusters = std::vector<NMX::SmartCluster>;

  Id AddSmart(const char* name, const Clusters& clusters)
  {
    const Id id = Add(ESubjectKind::SmartObjects, name);
    Set(id, Paths::SmartClusters(), clusters);
    return id;
  }

  /// One edit; committed when it succeeds.
  template <class Edit>
  IResult Try(Edit edit)
  {
    const auto editor = store->Editor();
    const IResult edited = edit(*editor);
    return edited.Failed() ? edited : editor->Commit();
  }

  std::vector<std::string> Labels(Id id)
  {
    std::vector<std::string> labels;
    for (const NMX::SmartCluster& cluster : Get<Clusters>(id, Paths::SmartClusters()))
      labels.push_back(cluster.label + ':' + cluster.deviceUrn);
    return labels;
  }

  std::vector<std::string> SmartNames()
  {
    std::vector<Id> ids;
    EXPECT_TRUE(store->Reader()->Subjects(ESubjectKind::SmartObjects, ids).Succeeded());
    std::vector<std::string> names;
    for (const Id id : ids)
      names.push_back(Get<std::string>(id, Paths::Name()));
    return names;
  }

  const Id glove = AddSmart("Glove", {{"Back", "d1", 1, "T"}, {"Palm", "d2", 2, "T"}});
  const Id wand = AddSmart("Wand", {{"Back", "d3", 3, "T"}});
  const Id empty = AddSmart("Empty", {});
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  const Id ada = Add(ESubjectKind::CharactersFromClusters, "Ada");
};

}

TEST_F(PanelEditsTest, MergedClustersLieInTheFirstObjectAndAreToldApart)
{
  for (const std::vector<Id>& refused : {std::vector<Id>{}, {glove}, {glove, crate}, {glove, Id(999)}})
    EXPECT_EQ(Try([&](NMX::IEntryEditor& editor) { return Subjects::Merge(editor, refused); }),
              IResult(EResult::InvalidArgument));
  const std::vector<Id> all{wand, glove, empty};
  EXPECT_TRUE(Subjects::CheckMerge(*store->Reader(), all).Succeeded());
  EXPECT_EQ(Try([&](NMX::IEntryEditor& editor) { return Subjects::Merge(editor, all); }), IResult(EResult::Ok));
  EXPECT_THAT(Labels(wand), ElementsAre("Back:d3", "Back 2:d1", "Palm:d2"));
  EXPECT_THAT(SmartNames(), ElementsAre("Wand"));
}

TEST_F(PanelEditsTest, ASplitObjectKeepsItsFirstClusterAndTheNewOnesItsLooks)
{
  for (const std::vector<Id>& refused : {std::vector<Id>{}, {wand}, {glove, crate}, {empty}})
    EXPECT_EQ(Try([&](NMX::IEntryEditor& editor) { return Subjects::Split(editor, refused); }),
              IResult(EResult::InvalidArgument));
  Add(ESubjectKind::Props, "Glove Palm"); // takes the name
  Set(glove, Paths::ColourRGBA(), NMX::Colour{1, 2, 3, 4});
  Set(glove, Paths::ProximityGroupName(), std::string("Hands"));
  Set(glove, Paths::Enabled(), false);
  EXPECT_EQ(Try([&](NMX::IEntryEditor& editor) { return Subjects::Split(editor, std::vector{glove, wand}); }),
            IResult(EResult::Ok));
  EXPECT_THAT(SmartNames(), ElementsAre("Glove", "Wand", "Empty", "Glove 2"));
  Id made;
  ASSERT_TRUE(store->Reader()->FindByName("Glove 2", made).Succeeded());
  EXPECT_THAT(Labels(glove), ElementsAre("Back:d1"));
  EXPECT_THAT(Labels(made), ElementsAre("Palm:d2"));
  EXPECT_EQ(Get<NMX::Colour>(made, Paths::ColourRGBA()), (NMX::Colour{1, 2, 3, 4}));
  EXPECT_EQ(Get<std::string>(made, Paths::ProximityGroupName()), "Hands");
  EXPECT_FALSE(Get<bool>(made, Paths::Enabled()));
}

TEST_F(PanelEditsTest, ClustersAreSwappedBetweenObjectsAndWithinOne)
{
  const auto swap = [&](Id first, unsigned firstIndex, Id second, unsigned secondIndex)
  {
    return Try([&](NMX::IEntryEditor& editor)
               { return Subjects::Swap(editor, first, firstIndex, second, secondIndex); });
  };
  EXPECT_EQ(swap(glove, 0, empty, 0), IResult(EResult::InvalidArgument));
  EXPECT_EQ(swap(wand, 0, wand, 0), IResult(EResult::InvalidArgument)) << "one cluster only";
  EXPECT_EQ(swap(glove, 0, crate, 0), IResult(EResult::InvalidArgument));
  EXPECT_EQ(swap(glove, 2, wand, 0), IResult(EResult::InvalidIndex));
  EXPECT_EQ(swap(glove, 0, wand, static_cast<unsigned>(-1)), IResult(EResult::InvalidIndex));
  EXPECT_EQ(swap(glove, 1, wand, 0), IResult(EResult::Ok));
  EXPECT_THAT(Labels(glove), ElementsAre("Back:d1", "Back:d3"));
  EXPECT_THAT(Labels(wand), ElementsAre("Palm:d2"));
  EXPECT_EQ(swap(glove, 0, glove, 1), IResult(EResult::Ok));
  EXPECT_THAT(Labels(glove), ElementsAre("Back:d3", "Back:d1"));
}

TEST_F(PanelEditsTest, ObjectsAreAssignedToEmptySlotsAndTakenOutAgain)
{
  Set(ada, Paths::Slots(), std::vector<NMX::Slot>{{Id(7), "Head"}, {Id(3), "Hand"}});
  const auto assign = [&](Id object, Id character, unsigned slot)
  { return Try([&](NMX::IEntryEditor& editor) { return Subjects::Assign(editor, object, character, slot); }); };
  EXPECT_EQ(assign(ada, ada, 0), IResult(EResult::InvalidType));
  EXPECT_EQ(assign(crate, glove, 0), IResult(EResult::NotSupported));
  EXPECT_EQ(assign(crate, ada, 2), IResult(EResult::InvalidIndex));
  EXPECT_EQ(assign(Id(999), ada, 0), IResult(EResult::InvalidId));
  EXPECT_EQ(assign(crate, ada, 1), IResult(EResult::Ok));
  EXPECT_EQ(assign(glove, ada, 1), IResult(EResult::AlreadySet));
  Set(ada, Paths::ParentSubjectId(), wand);
  EXPECT_EQ(assign(wand, ada, 0), IResult(EResult::InvalidValue)) << "the character is beneath it";
  EXPECT_THAT(Subjects::UnassignedObjects(*store->Reader()), ElementsAre(glove, wand, empty));
  const auto slots = Subjects::EmptySlots(*store->Reader());
  ASSERT_EQ(slots.size(), 1U);
  EXPECT_EQ(slots[0].character, ada);
  EXPECT_EQ(slots[0].slot.name, "Head");

  const auto detach = [&](const std::vector<Id>& objects)
  { return Try([&](NMX::IEntryEditor& editor) { return Subjects::Detach(editor, objects); }); };
  Set(crate, Paths::AutoAssignEnabled(), true);
  EXPECT_EQ(detach({}), IResult(EResult::InvalidArgument));
  EXPECT_EQ(detach({crate, glove}), IResult(EResult::InvalidArgument)) << "one is in no slot";
  EXPECT_EQ(Get<Id>(crate, Paths::ParentSubjectId()), ada);
  EXPECT_EQ(detach({crate}), IResult(EResult::Ok));
  EXPECT_FALSE(Get<Id>(crate, Paths::ParentSubjectId()).Valid());
  EXPECT_FALSE(Get<bool>(crate, Paths::AutoAssignEnabled()));
  EXPECT_EQ(Subjects::EmptySlots(*store->Reader()).size(), 2U);
}
