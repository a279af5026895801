#include "SubjectStoreUI/WarningGadget.h"
#include "tests/Support/Eventually.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ModelFixture.h"
#include "tests/Support/ModelShadow.h"
#include "tests/Support/RandomStoreEdits.h"

#include <gmock/gmock.h>

#include <atomic>
#include <map>
#include <thread>

using namespace SubjectStoreUI;
using NMX::ESubjectKind;
using testing::ElementsAre;
using testing::IsEmpty;
namespace Paths = NMX::Paths;
namespace Role = SubjectsModelRole;

namespace
{

class SubjectModelsTest : public ModelFixture
{
protected:
  Names Sentences() const
  {
    Names sentences;
    for (const QVariant& warning : summary.subjectWarnings())
      sentences.push_back(warning.value<VWarningGadget>().text.toStdString());
    return sentences;
  }

  /// The list and both trees.
  std::vector<std::shared_ptr<VSubjectModelStoreBase>> MakeEach()
  {
    return {MakeList(), MakeTree(ESubjectKind::GeneralSubjects), MakeSlotTree()};
  }

  /// What is told of each.
  static std::vector<std::unique_ptr<ModelShadow>>
  Shadow(const std::vector<std::shared_ptr<VSubjectModelStoreBase>>& models)
  {
    std::vector<std::unique_ptr<ModelShadow>> shadows;
    for (const auto& model : models)
      shadows.push_back(std::make_unique<ModelShadow>(*model, Untold(*model)));
    return shadows;
  }
};

std::vector<NMX::Slot> NamedSlots(std::initializer_list<const char*> names)
{
  std::vector<NMX::Slot> made;
  for (const char* name : names)
    made.push_back({NMX::TSubjectStoreId(made.size() + 1), name});
  return made;
}

}

TEST_F(SubjectModelsTest, TheListIsInTheOrderOfIdsAndSaysWhatTheStoreSays)
{
  const Id glove = Add(ESubjectKind::SmartObjects, "Glove");
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  Set(glove, Paths::SmartClusters(),
      std::vector<NMX::SmartCluster>{{"Back", "urn-1", 3, "Corvex1"}, {"Palm", "", 0, "Corvex1"}});
  Set(crate, Paths::Markers(), std::vector<NMX::Position>{{1, 2, 3}});
  Set(crate, Paths::FilePath(), std::wstring(L"/\u00e4.vsk"));
  const auto model = MakeList();
  const ModelShadow shadow(*model);
  EXPECT_THAT(NamesBeneath(*model), ElementsAre("Glove", "Crate"));
  const QModelIndex first = model->index(0, 0);
  const QModelIndex second = model->index(1, 0);
  EXPECT_EQ(IdAt(first), glove);
  EXPECT_EQ(first.data(Role::SubjectFlags).toUInt(), 3U);
  EXPECT_EQ(first.data(Role::SubjectSmartClusterDeviceNames).toStringList(), (QStringList{"urn-1", ""}));
  EXPECT_EQ(first.data(Role::SubjectPatterns).toList(), (QVariantList{3U, 0U}));
  EXPECT_EQ(first.data(Role::SubjectWarnings).toList(), (QVariantList{3, 7, 8})) << "pattern, missing device, no link";
  EXPECT_EQ(second.data(Role::SubjectRoles).toList(), (QVariantList{0}));
  EXPECT_EQ(second.data(Role::SubjectFilePath).toString(), QString::fromUtf8("/\xC3\xA4.vsk"));
  EXPECT_EQ(second.data(Role::SubjectSmartAndBasicMarkers).toList().at(0).value<VPositionGadget>().z, 3);
  EXPECT_EQ(second.data(Role::SubjectProxySortName).toString(), "Crate");
  EXPECT_EQ(second.data(Role::SubjectSelectionItem).value<VSelectionItemGadget>(), VSelectionItemGadget(crate));
  for (const int role : {Role::SubjectHasParent, Role::SubjectIsSubjectElement, Role::SubjectIsSlot})
    EXPECT_EQ(second.data(role), QVariant(false));
  for (const int role : std::initializer_list<int>{Role::SubjectSlotName, Role::SubjectSlotShortName,
                                                   Role::SubjectLinkedCameraURN, 256, 279, -1})
    EXPECT_FALSE(second.data(role).isValid()) << role;
  EXPECT_EQ(static_cast<int>(model->flags(second)), 0x21);
  EXPECT_EQ(model->indexForSubject(crate), second);
  EXPECT_FALSE(model->indexForSubject(Id(99)).isValid());
  for (const auto& [row, column] : {std::pair(-1, 0), {2, 0}, {0, 1}, {0, -1}})
    EXPECT_FALSE(model->index(row, column).isValid());
  EXPECT_FALSE(model->data({}, Role::SubjectName).isValid());
  EXPECT_FALSE(model->setData({}, "x", Role::SubjectName));
  EXPECT_EQ(static_cast<int>(model->flags({})), 0);
  EXPECT_THAT(Sentences(),
              ElementsAre("1 smart object has not been assigned a pattern.",
                          "1 smart object has a missing linked device.", "1 smart object has empty device links."));
}

TEST_F(SubjectModelsTest, RoleNamesAreTheKeysWithASmallLetter)
{
  const auto names = MakeList()->roleNames();
  EXPECT_EQ(names.size(), 22);
  EXPECT_EQ(names.value(257), "subjectStoreId");
  EXPECT_EQ(names.value(274), "subjectLinkedCameraURN");
  EXPECT_EQ(names.value(278), "subjectIsSubjectElement");
  EXPECT_EQ(RoleName("NameRole"), "name");
  EXPECT_EQ(RoleName("EName"), "name");
  EXPECT_EQ(RoleName("Enabled"), "enabled");
  EXPECT_EQ(RoleName("EA"), "eA");
}

TEST_F(SubjectModelsTest, NameAndEnabledAreEditedAndTheRowChangesWhenTheStoreHas)
{
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  Add(ESubjectKind::BasicObjects, "Barrel");
  const auto model = MakeList();
  ModelShadow shadow(*model);
  const QModelIndex index = model->index(0, 0);
  const LogCapture log;
  EXPECT_TRUE(model->setData(index, "Box", Role::SubjectName));
  EXPECT_TRUE(model->setData(index, false, Role::SubjectEnabled));
  EXPECT_THAT(log.messages, ElementsAre("Set subject [1] name: Box", "Set subject [1] enabled: false"));
  EXPECT_EQ(shadow.changes, 0);
  EXPECT_FALSE(model->setData(index, "Barrel", Role::SubjectName));
  EXPECT_FALSE(model->setData(index, "a/b", Role::SubjectName));
  EXPECT_FALSE(model->setData(index, 5, Role::SubjectFlags));
  archive.full = true;
  EXPECT_FALSE(model->setData(index, "Case", Role::SubjectName));
  archive.full = false;
  model->refresh();
  EXPECT_EQ(shadow.changes, 1);
  shadow.Check();
  EXPECT_EQ(Get<std::string>(crate, Paths::Name()), "Box");
  EXPECT_FALSE(Get<bool>(crate, Paths::Enabled()));
}

TEST_F(SubjectModelsTest, ARowIsToldOfInTheRolesThatChanged)
{
  const Id glove = Add(ESubjectKind::SmartObjects, "Glove");
  const auto list = MakeList();
  const auto tree = MakeTree(ESubjectKind::SmartObjects);
  std::vector<QList<int>> ofList;
  std::vector<QList<int>> ofTree;
  const auto record = [](QAbstractItemModel& model, std::vector<QList<int>>& told)
  {
    QObject::connect(&model, &QAbstractItemModel::dataChanged, &model,
                     [&told](const QModelIndex&, const QModelIndex&, const QList<int>& roles)
                     { told.push_back(roles); });
  };
  record(*list, ofList);
  record(*tree, ofTree);
  const auto refresh = [&]
  {
    ofList.clear();
    ofTree.clear();
    list->refresh();
    tree->refresh();
  };
  refresh();
  EXPECT_THAT(ofList, IsEmpty());
  Set(glove, Paths::WarningObjectConfusion(), true);
  refresh();
  EXPECT_THAT(ofList, ElementsAre(QList<int>{265}));
  EXPECT_THAT(ofTree, ElementsAre(QList<int>{265}));
  Set(glove, Paths::AdditionalMarkerPositions(), std::vector<NMX::Position>{{1, 2, 3}});
  refresh();
  EXPECT_THAT(ofList, ElementsAre(QList<int>{276}));
  Set(glove, Paths::SmartClusters(), std::vector<NMX::SmartCluster>{{"Back", "", 1, "Corvex1"}});
  refresh();
  EXPECT_THAT(ofList, ElementsAre(QList<int>{265, 266, 271})) << "it is warned of the device, too";
  EXPECT_THAT(ofTree, ElementsAre(QList<int>{265}));
  Set(glove, Paths::Enabled(), false);
  refresh();
  EXPECT_THAT(ofList, ElementsAre(Role::All()));
}

TEST_F(SubjectModelsTest, AnEmptyStoreResetsTheModelAndItsSummary)
{
  const Id glove = Add(ESubjectKind::SmartObjects, "Glove");
  Set(glove, Paths::WarningObjectConfusion(), true);
  const auto model = MakeList();
  ModelShadow shadow(*model);
  EXPECT_EQ(summary.totalWarningCount(), 1);
  Remove(glove);
  model->refresh();
  EXPECT_EQ(shadow.resets, 1);
  EXPECT_EQ(shadow.removals, 0);
  EXPECT_EQ(summary.totalWarningCount(), 0);
  Add(ESubjectKind::Props, "Chair");
  model->refresh();
  EXPECT_EQ(shadow.inserts, 1);
  shadow.Check();
}

TEST_F(SubjectModelsTest, ChangesOfAnIntervalCostOneRefresh)
{
  const auto eager = MakeList();
  ModelShadow eagerShadow(*eager);
  eager->followStore(0);
  auto patient = MakeList();
  ModelShadow patientShadow(*patient);
  patient->followStore(50);
  for (const char* name : {"A", "B", "C"})
  {
    Add(ESubjectKind::Props, name);
    gui->RunAll();
  }
  EXPECT_EQ(eagerShadow.inserts, 3);
  EXPECT_EQ(patient->rowCount(), 0);
  EXPECT_TRUE(Eventually([&] { return patient->rowCount() > 0; },
                         [] { QCoreApplication::processEvents(QEventLoop::AllEvents, 10); }));
  EXPECT_EQ(patient->rowCount(), 3);
  patientShadow.Check();
  Add(ESubjectKind::Props, "D");
}

TEST_F(SubjectModelsTest, ANotificationThatComesTooLateFindsNobody)
{
  auto model = MakeList();
  model->followStore(0);
  Add(ESubjectKind::Props, "A");
  model.reset();
  EXPECT_GT(gui->RunAll(), 0);
}

TEST_F(SubjectModelsTest, TheTreeShowsChildrenBeneathTheSubjectsOfItsKind)
{
  const Id body = Add(ESubjectKind::GeneralSubjects, "Body");
  const Id arm = Add(ESubjectKind::GeneralSubjects, "Arm");
  const Id hand = Add(ESubjectKind::Props, "Hand");
  Set(hand, Paths::ParentSubjectId(), arm);
  Set(hand, Paths::WarningObjectConfusion(), true);
  const auto tree = MakeTree(ESubjectKind::GeneralSubjects);
  ModelShadow shadow(*tree);
  Set(arm, Paths::ParentSubjectId(), body);
  tree->refresh();
  shadow.Check();
  EXPECT_THAT(NamesBeneath(*tree), ElementsAre("Body", "Arm")) << "a subject may be at both levels";
  const QModelIndex first = tree->index(0, 0);
  EXPECT_THAT(NamesBeneath(*tree, first), ElementsAre("Arm"));
  const QModelIndex child = tree->index(0, 0, first);
  EXPECT_EQ(tree->rowCount(child), 0) << "although it has a child in the store";
  EXPECT_EQ(tree->parent(child), first);
  EXPECT_FALSE(tree->parent(first).isValid());
  EXPECT_EQ(child.data(Role::SubjectHasParent), QVariant(true));
  EXPECT_EQ(child.data(Role::SubjectIsSlot), QVariant(true));
  EXPECT_EQ(first.data(Role::SubjectHasParent), QVariant(false));
  EXPECT_EQ(tree->indexForSubject(arm), tree->index(1, 0));
  EXPECT_EQ(tree->indexForSubject(hand).parent(), tree->index(1, 0));
  EXPECT_EQ(Sentences().back(), "1 object has a marker pattern that could be confused with another object, or another "
                                "view of itself.");
  EXPECT_FALSE(tree->index(0, 0, child).isValid());
  EXPECT_FALSE(tree->index(-1, 0, first).isValid());
  EXPECT_TRUE(tree->setData(child, "Left arm", Role::SubjectName));

  // A child that only changes is told of once, and one that goes, too.
  tree->refresh();
  EXPECT_THAT(NamesBeneath(*tree, first), ElementsAre("Left arm"));
  shadow.changes = 0;
  Set(hand, Paths::Enabled(), false);
  tree->refresh();
  EXPECT_EQ(std::exchange(shadow.changes, 0), 1);
  tree->refresh();
  EXPECT_EQ(shadow.changes, 0);
  Remove(hand);
  tree->refresh();
  shadow.Check();
  EXPECT_EQ(shadow.removals, 1);
  EXPECT_THAT(Sentences(), testing::Not(testing::Contains(testing::HasSubstr("be confused"))));
}

TEST_F(SubjectModelsTest, ANewSubjectArrivesBeforeItsChildrenWhichArriveTogether)
{
  const auto tree = MakeTree(ESubjectKind::GeneralSubjects);
  ModelShadow shadow(*tree);
  std::vector<std::string> told;
  QObject::connect(tree.get(), &QAbstractItemModel::rowsInserted, tree.get(),
                   [&](const QModelIndex& parent, int first, int last)
                   {
                     told.push_back((parent.isValid() ? "child " : "top ") + std::to_string(first) + "-" +
                                    std::to_string(last));
                     EXPECT_TRUE(parent.isValid() || tree->rowCount(tree->index(first, 0)) == 0);
                   });
  const Id body = Add(ESubjectKind::GeneralSubjects, "Body");
  for (const char* name : {"A", "B", "C"})
    Set(Add(ESubjectKind::Props, name), Paths::ParentSubjectId(), body);
  tree->refresh();
  EXPECT_THAT(told, ElementsAre("top 0-0", "child 0-2"));
  shadow.Check();
}

TEST_F(SubjectModelsTest, SlotsAreRowsFilledOrNot)
{
  const Id ada = Add(ESubjectKind::CharactersFromClusters, "Ada");
  const Id glove = Add(ESubjectKind::SmartObjects, "Glove");
  Set(ada, Paths::Slots(), NamedSlots({"LeftHand", "pelvis", "x"}));
  const auto fill = [&](Id object, int slot)
  {
    Set(object, Paths::ParentSubjectId(), ada);
    Set(object, Paths::ParentSubjectSlotId(), Id(slot));
  };
  fill(glove, 2);
  Set(glove, Paths::WarningObjectConfusion(), true);
  const auto tree = MakeSlotTree();
  ModelShadow shadow(*tree);
  const QModelIndex character = tree->index(0, 0);
  EXPECT_THAT(NamesBeneath(*tree, character), ElementsAre("", "Glove", ""));
  const QModelIndex empty = tree->index(0, 0, character);
  const QModelIndex filled = tree->index(1, 0, character);
  const struct
  {
    int role;
    QVariant ofEmpty;
    QVariant ofFilled;
  } rows[] = {{Role::SubjectEnabled, false, true},
              {Role::SubjectIsAutoAssignable, false, false},
              {Role::SubjectIsSubjectElement, false, false},
              {Role::SubjectIsSlot, true, true},
              {Role::SubjectHasParent, true, true},
              {Role::SubjectSlotName, "LeftHand", "pelvis"},
              {Role::SubjectSlotShortName, "LH", "PE"},
              {Role::SubjectProxySortName, "0", "1"},
              {Role::SubjectFlags, {}, 3U},
              {Role::SubjectStoreId, {}, QVariant::fromValue(VStoreIdGadget(glove))},
              {Role::SubjectSelectionItem, QVariant::fromValue(VSelectionItemGadget(ada, 0)),
               QVariant::fromValue(VSelectionItemGadget(glove))}};
  for (const auto& [role, ofEmpty, ofFilled] : rows)
  {
    EXPECT_EQ(empty.data(role), ofEmpty) << role;
    EXPECT_EQ(filled.data(role), ofFilled) << role;
  }
  EXPECT_EQ(tree->index(2, 0, character).data(Role::SubjectSlotShortName).toString(), "??");
  EXPECT_EQ(ShortSlotName("leftHandSide"), "LH");
  EXPECT_EQ(ShortSlotName(QString()), "??");
  EXPECT_FALSE(tree->setData(empty, "x", Role::SubjectName));
  EXPECT_FALSE(tree->setData(empty, true, Role::SubjectEnabled));
  EXPECT_TRUE(tree->setData(filled, "Mitten", Role::SubjectName));
  EXPECT_EQ(tree->rowCount(filled), 0);
  EXPECT_EQ(tree->parent(filled), character);

  fill(glove, 1);
  tree->refresh();
  shadow.Check();
  EXPECT_THAT(NamesBeneath(*tree, character), ElementsAre("Mitten", "", ""));
  EXPECT_EQ(shadow.inserts + shadow.removals + shadow.resets, 0) << "the slots are the same";
  Set(ada, Paths::Slots(), std::vector<NMX::Slot>{{Id(3), "z"}, {Id(1), "Hand"}, {Id(1), "Twice"}, {Id(), "No id"}});
  tree->refresh();
  shadow.Check();
  EXPECT_THAT(NamesBeneath(*tree, character), ElementsAre("", "Mitten"));
  shadow.changes = 0;
  tree->refresh();
  EXPECT_EQ(shadow.changes + shadow.resets, 0);
}

TEST_F(SubjectModelsTest, RandomEditsAreToldOfExactly)
{
  const auto models = MakeEach();
  const auto shadows = Shadow(models);
  const VSubjectModelStoreBase& list = *models[0];
  std::map<Id, QPersistentModelIndex> marked;
  RandomStoreEdits edits(20261121);
  for (int step = 0; step < 20000; ++step)
  {
    edits.Transaction(*store);
    if (step % 3 == 0)
      for (const auto& model : models)
        model->refresh();
    if (step % 60 != 0)
      continue;
    const auto fresh = MakeEach();
    for (std::size_t model = 0; model < models.size(); ++model)
    {
      shadows[model]->Check();
      ExpectSame(*models[model], *fresh[model]);
    }
    for (const auto& [subject, row] : marked)
      ASSERT_EQ(QModelIndex(row), list.indexForSubject(subject)) << "also when it has gone";
    std::erase_if(marked, [](const auto& mark) { return !mark.second.isValid(); });
    if (const int rows = list.rowCount({}); rows > 0)
      marked.insert_or_assign(IdAt(list.index(step / 60 % rows, 0)), list.index(step / 60 % rows, 0));
    if (HasFailure())
      FAIL() << "step " << step;
  }
  EXPECT_GT(shadows[0]->resets, 0);
  EXPECT_GT(shadows[0]->removals, 100);
  EXPECT_GT(shadows[2]->inserts, 1000);
}

TEST_F(SubjectModelsTest, EditsOfOtherThreadsAreFollowed)
{
  const auto models = MakeEach();
  const auto shadows = Shadow(models);
  for (const auto& model : models)
    model->followStore(0);
  std::atomic<int> commits = 0;
  std::atomic<int> editing = 3;
  {
    std::vector<std::jthread> threads;
    for (const unsigned seed : {20261123U, 20261124U, 20261125U})
      threads.emplace_back(
          [&, seed]
          {
            for (RandomStoreEdits edits(seed); commits++ < 2000;)
              edits.Transaction(*store);
            --editing;
          });
    const auto follow = [this]
    {
      if (gui->RunAll() == 0)
        std::this_thread::yield();
    };
    EXPECT_TRUE(Eventually([&] { return editing == 0; }, follow, std::chrono::seconds(100)));
  }
  EXPECT_GT(archive.commits, 1000);
  gui->RunAll();
  const auto fresh = MakeEach();
  for (std::size_t model = 0; model < models.size(); ++model)
  {
    shadows[model]->Check();
    ExpectSame(*models[model], *fresh[model]);
    EXPECT_GT(shadows[model]->inserts, 10);
  }
}
