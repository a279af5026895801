#include "SubjectStoreUI/NaturalOrder.h"
#include "SubjectStoreUI/VSortSubjectsProxyModel.h"
#include "SubjectStoreUI/VSubjectElementModel.h"
#include "SubjectStoreUI/VSubjectStoreProxyModel.h"
#include "tests/Support/ModelFixture.h"
#include "tests/Support/ModelShadow.h"
#include "tests/Support/RandomStoreEdits.h"

#include <QItemSelectionModel>
#include <QMetaProperty>

#include <gmock/gmock.h>

#include <algorithm>
#include <map>
#include <utility>

using namespace SubjectStoreUI;
using NMX::ESubjectKind;
using testing::ElementsAre;
using testing::IsEmpty;
namespace Paths = NMX::Paths;
namespace Role = SubjectsModelRole;

namespace
{

/// Its element models come and go without a reset.
template <class Base>
struct Loose : Base
{
  using Base::Base;
  [[nodiscard]] std::vector<std::shared_ptr<VSubjectElementModel>> elementModels() const override { return attached; }

  std::vector<std::shared_ptr<VSubjectElementModel>> attached;
};

/// Tells of rows that moved, although they did not.
template <class Base>
struct Moving : Base
{
  using Base::Base;

  bool TellMove(const QModelIndex& from, const QModelIndex& to, int row)
  {
    const bool begun = this->beginMoveRows(from, 0, 0, to, row);
    if (begun)
      this->endMoveRows();
    return begun;
  }
};

/// Writes down the row signals of a model.
class Recorder
{
public:
  explicit Recorder(QAbstractItemModel& model)
  {
    using M = QAbstractItemModel;
    const auto record = [&](auto signal, const std::string& text)
    {
      QObject::connect(&model, signal, &m_context, [this, text](const QModelIndex& parent, int first, int last)
                       { told.push_back(text + Place(parent, first) + '-' + std::to_string(last)); });
    };
    record(&M::rowsInserted, "insert ");
    record(&M::rowsRemoved, "remove ");
    QObject::connect(
        &model, &M::rowsMoved, &m_context,
        [this](const QModelIndex& from, int first, int last, const QModelIndex& to, int row)
        { told.push_back("move " + Place(from, first) + '-' + std::to_string(last) + " to " + Place(to, row)); });
    QObject::connect(&model, &M::dataChanged, &m_context,
                     [this](const QModelIndex& first, const QModelIndex& last, const QList<int>& roles)
                     {
                       told.push_back("change " + Place(first.parent(), first.row()) + '-' +
                                      std::to_string(last.row()) + " in " + std::to_string(roles.size()));
                     });
    QObject::connect(&model, &M::modelReset, &m_context, [this] { told.emplace_back("reset"); });
    QObject::connect(&model, &M::layoutChanged, &m_context, [this] { told.emplace_back("sort"); });
  }

  [[nodiscard]] Names Take() { return std::exchange(told, {}); }

private:
  static std::string Place(const QModelIndex& parent, int row)
  {
    return (parent.isValid() ? NameOf(parent) + '/' : "") + std::to_string(row);
  }

  QObject m_context;
  Names told;
};

class ProxyModelsTest : public ModelFixture
{
protected:
  std::shared_ptr<VSubjectElementModel> Attach(VSubjectModelStoreBase& base)
  {
    auto elements = NMX::MakeShared<VSubjectElementModel>(data, base);
    base.attachElementModel(elements);
    return elements;
  }

  void SetMarkers(Id id, int count)
  {
    Set(id, Paths::Markers(), std::vector<NMX::Position>(static_cast<std::size_t>(count), {1, 2, 3}));
  }

  std::unique_ptr<VSortSubjectsProxyModel> Sorted(std::shared_ptr<QAbstractItemModel> source)
  {
    return std::make_unique<VSortSubjectsProxyModel>(std::move(source), VSubjectTypeGadget(ESubjectKind::Props),
                                                     "Props", &summary);
  }
};

}

TEST_F(ProxyModelsTest, ASectionIsSortedAsPeopleSortNames)
{
  const struct
  {
    Names added;
    Names sorted;
  } cases[] = {{{"Subject10", "subject2", "Subject1"}, {"Subject1", "subject2", "Subject10"}},
               {{"zed", "Zed", "Yak", "\u00e9t\u00e9", "zebra"}, {"Yak", "zebra", "Zed", "zed", "\u00e9t\u00e9"}},
               {{"wand", "Ada", "7wand", "10"}, {"7wand", "10", "Ada", "wand"}}};
  for (const auto& [added, expected] : cases)
  {
    std::vector<Id> ids;
    for (const std::string& name : added)
      ids.push_back(Add(ESubjectKind::Props, name));
    EXPECT_EQ(NamesBeneath(*Sorted(MakeList())), expected);
    for (const Id id : ids)
      Remove(id);
  }

  const Id ada = Add(ESubjectKind::CharactersFromClusters, "Ada");
  std::vector<NMX::Slot> slots;
  for (std::uint64_t slot = 1; slot <= 12; ++slot)
    slots.push_back({Id(slot), "Slot" + std::to_string(100 - slot)});
  Set(ada, Paths::Slots(), slots);
  const auto tree = MakeSlotTree();
  const auto sorted = Sorted(tree);
  for (int row = 0; row < 12; ++row)
    EXPECT_EQ(sorted->mapToSource(sorted->index(row, 0, sorted->index(0, 0))).row(), row);
}

TEST_F(ProxyModelsTest, ASectionSaysWhatItIsOfAndKeepsItsModel)
{
  auto list = MakeList();
  const std::weak_ptr<VSubjectListModelStore> watch = list;
  auto shown = std::make_unique<VSubjectWarningSummary>();
  auto sorted = std::make_unique<VSortSubjectsProxyModel>(std::move(list), VSubjectTypeGadget(ESubjectKind::Markerless),
                                                          "People", shown.get());
  EXPECT_FALSE(watch.expired());
  const QMetaObject& meta = *sorted->metaObject();
  Names properties;
  for (int i = meta.propertyOffset(); i < meta.propertyCount(); ++i)
    properties.emplace_back(meta.property(i).name());
  EXPECT_THAT(properties, ElementsAre("allowedSubjectType", "typeDisplayName", "warningSummary"));
  const auto type = sorted->property("allowedSubjectType").value<VSubjectTypeGadget>();
  EXPECT_EQ(VSubjectTypeGadget::staticMetaObject.property(0).readOnGadget(&type), QVariant(5));
  EXPECT_EQ(VSubjectTypeGadget::staticMetaObject.property(1).readOnGadget(&type), QVariant("Markerless"));
  EXPECT_EQ(sorted->property("typeDisplayName"), QVariant("People"));
  EXPECT_EQ(sorted->property("warningSummary").value<VSubjectWarningSummary*>(), shown.get());
  shown.reset();
  EXPECT_EQ(sorted->warningSummary(), nullptr);
  sorted.reset();
  EXPECT_TRUE(watch.expired());
  EXPECT_EQ(Sorted(nullptr)->rowCount(), 0);
}

TEST_F(ProxyModelsTest, ASectionIsSortedOnceAfterTextsCameOrChanged)
{
  const Id b = Add(ESubjectKind::Props, "B");
  Add(ESubjectKind::Props, "C");
  const auto list = MakeList();
  const auto sorted = Sorted(list);
  const ModelShadow shadow(*sorted);
  Recorder recorder(*sorted);
  const auto refresh = [&]
  {
    list->refresh();
    Names told = recorder.Take();
    QCoreApplication::processEvents();
    QCoreApplication::processEvents();
    return std::pair(told, recorder.Take());
  };
  Set(b, Paths::WarningObjectConfusion(), true);
  EXPECT_EQ(refresh(), std::pair(Names{"change 0-0 in 1"}, Names{})) << "the names are as they were";
  Add(ESubjectKind::Props, "A");
  Add(ESubjectKind::Props, "B2");
  EXPECT_EQ(refresh(), std::pair(Names({"insert 2-2", "insert 3-3"}), Names{"sort"}));
  EXPECT_THAT(NamesBeneath(*sorted), ElementsAre("A", "B", "B2", "C"));
  Change([&](NMX::IEntryEditor& editor) { EXPECT_TRUE(editor.Rename(b, "D", NMX::ENotify::Yes).Succeeded()); });
  EXPECT_EQ(refresh(), std::pair(Names{"change 1-1 in 22"}, Names{"sort"}));
  EXPECT_THAT(NamesBeneath(*sorted), ElementsAre("A", "B2", "C", "D"));
  Attach(*list);
  EXPECT_EQ(refresh(), std::pair(Names{"reset"}, Names{"sort"}));
  EXPECT_THAT(NamesBeneath(*sorted), ElementsAre("A", "B2", "C", "D"));
}

namespace
{

/// Texts that can be changed without a word, and how often they were read.
struct CountedTexts : QAbstractListModel
{
  [[nodiscard]] int rowCount(const QModelIndex& parent) const override
  {
    return parent.isValid() ? 0 : static_cast<int>(texts.size());
  }
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override
  {
    reads += role == Qt::UserRole;
    return texts[static_cast<std::size_t>(index.row())];
  }
  void Reset()
  {
    beginResetModel();
    endResetModel();
  }

  std::vector<QString> texts;
  mutable int reads = 0;
};

struct OpenSortProxy : VSortSubjectsProxyModel
{
  using VSortSubjectsProxyModel::lessThan;
  using VSortSubjectsProxyModel::VSortSubjectsProxyModel;
};

}

TEST_F(ProxyModelsTest, ASortReadsEachTextOnceAndForgetsIt)
{
  const auto source = std::make_shared<CountedTexts>();
  for (int i = 0; i < 500; ++i)
    source->texts.push_back("Subject " + QString::number(i * 7919 % 250));
  OpenSortProxy sorted(source, VSubjectTypeGadget(), "", nullptr, Qt::UserRole);
  const QModelIndex first = source->index(0);
  const QModelIndex second = source->index(1);
  const auto reads = [&] { return std::exchange(source->reads, 0); };
  EXPECT_EQ(reads(), 500);
  for (int row = 0; row < 500; row += 2)
    EXPECT_EQ(sorted.mapToSource(sorted.index(row + 1, 0)).row() - sorted.mapToSource(sorted.index(row, 0)).row(), 250)
        << "the same texts stay in their order";
  EXPECT_EQ(reads(), 0);
  source->texts[0] = "Subject 1000";
  EXPECT_TRUE(sorted.lessThan(second, first));
  EXPECT_EQ(reads(), 2);
  // Whoever hears of a new order may find other texts already.
  QObject::connect(&sorted, &QAbstractItemModel::layoutChanged, &sorted,
                   [&]
                   {
                     source->texts[0] = "";
                     EXPECT_TRUE(sorted.lessThan(first, second));
                   });
  sorted.sort(0);
  EXPECT_EQ(sorted.mapToSource(sorted.index(499, 0)), first) << "as its text was";
  EXPECT_EQ(reads(), 502);
  source->Reset();
  EXPECT_EQ(sorted.mapToSource(sorted.index(0, 0)), first);
  EXPECT_EQ(reads(), 500);
  EXPECT_TRUE(sorted.lessThan(first, second));
}

TEST_F(ProxyModelsTest, ElementsLieBeneathTheirSubjectAfterItsChildren)
{
  const Id body = Add(ESubjectKind::BasicObjects, "Body");
  const Id arm = Add(ESubjectKind::BasicObjects, "Arm");
  const Id hand = Add(ESubjectKind::SmartObjects, "Hand");
  Set(arm, Paths::ParentSubjectId(), body);
  Set(hand, Paths::ParentSubjectId(), body);
  SetMarkers(body, 2);
  const auto tree = MakeTree(ESubjectKind::BasicObjects);
  const auto joined = NMX::MakeShared<VSubjectStoreProxyModel>(tree);
  ModelShadow shadow(*joined);
  Attach(*tree);
  const auto again = Attach(*tree);
  EXPECT_THAT(NamesBeneath(*joined), ElementsAre("Body", "Arm"));
  const QModelIndex top = joined->index(0, 0);
  EXPECT_THAT(NamesBeneath(*joined, top), ElementsAre("Arm", "Hand", "Marker 1", "Marker 2", "Marker 1", "Marker 2"));
  EXPECT_THAT(NamesBeneath(*joined, joined->index(1, 0)), IsEmpty());
  EXPECT_THAT(NamesBeneath(*joined, joined->index(1, 0, top)), IsEmpty()) << "a child has nothing beneath it";
  const QModelIndex marker = joined->index(4, 0, top);
  EXPECT_EQ(marker.parent(), top);
  EXPECT_EQ(marker.data(Role::SubjectIsSubjectElement), QVariant(true));
  EXPECT_EQ(joined->columnCount(marker), 1);
  EXPECT_EQ(static_cast<int>(joined->flags(marker)), 0x21);
  for (const auto& [row, column] : {std::pair(-1, 0), {6, 0}, {0, 1}})
    EXPECT_FALSE(joined->index(row, column, top).isValid());
  EXPECT_EQ(joined->roleNames(), tree->roleNames());
  EXPECT_FALSE(joined->setData(marker, "x", Role::SubjectName));
  EXPECT_TRUE(joined->setData(joined->index(1, 0, top), "Left hand", Role::SubjectName));
  EXPECT_EQ(Get<std::string>(hand, Paths::Name()), "Left hand");

  // Rows above move those below, and what is told of an element tells its place.
  tree->refresh();
  const QPersistentModelIndex kept = joined->index(3, 0, top);
  Recorder recorder(*joined);
  Set(arm, Paths::ParentSubjectId(), Id());
  tree->refresh();
  EXPECT_THAT(recorder.Take(), ElementsAre("change 0-0 in 22", "remove Body/0-0", "change 1-1 in 22"));
  EXPECT_EQ(QModelIndex(kept), joined->index(2, 0, top));
  SetMarkers(body, 3);
  again->refresh();
  EXPECT_THAT(recorder.Take(), ElementsAre("insert Body/5-5"));
  Set(body, Paths::Markers(), std::vector<NMX::Position>{{1, 2, 3}, {4, 5, 6}});
  again->refresh();
  EXPECT_THAT(recorder.Take(), ElementsAre("remove Body/5-5", "change Body/4-4 in 0"));

  // A child's elements are not shown, even when somebody has asked for them.
  EXPECT_EQ(again->rowCount(tree->index(0, 0, tree->index(0, 0))), 0);
  Set(hand, Paths::SmartClusters(), std::vector<NMX::SmartCluster>(2));
  again->refresh();
  EXPECT_THAT(recorder.Take(), IsEmpty());
  Set(hand, Paths::Enabled(), false); // trees are not told of clusters alone
  tree->refresh();
  shadow.Check();
}

TEST_F(ProxyModelsTest, MovesAreForwardedAsWhatIsSeenOfThem)
{
  const Id body = Add(ESubjectKind::BasicObjects, "Body");
  const Id other = Add(ESubjectKind::BasicObjects, "Other");
  Set(Add(ESubjectKind::SmartObjects, "Hand"), Paths::ParentSubjectId(), body);
  SetMarkers(body, 3);
  SetMarkers(other, 1);
  const auto tree = NMX::MakeShared<Moving<VSubjectTreeModelStore>>(data, ESubjectKind::BasicObjects);
  const auto elements = NMX::MakeShared<Moving<VSubjectElementModel>>(data, *tree);
  tree->attachElementModel(elements);
  const auto joined = NMX::MakeShared<VSubjectStoreProxyModel>(tree);
  Recorder recorder(*joined);
  const QModelIndex first = tree->index(0, 0);
  const QModelIndex second = tree->index(1, 0);
  const QModelIndex child = tree->index(0, 0, first);
  EXPECT_TRUE(tree->TellMove({}, {}, 2));
  EXPECT_TRUE(tree->TellMove(first, second, 0));
  EXPECT_TRUE(elements->TellMove(first, first, 3));
  EXPECT_TRUE(elements->TellMove(first, second, 1));
  EXPECT_TRUE(elements->TellMove(second, child, 0));
  EXPECT_TRUE(elements->TellMove(child, first, 3));
  EXPECT_TRUE(elements->TellMove(child, {}, 0));
  EXPECT_THAT(recorder.Take(), ElementsAre("move 0-0 to 2", "move Body/0-0 to Other/0", "move Body/1-1 to Body/4",
                                           "move Body/1-1 to Other/1", "remove Other/0-0", "insert Body/4-4"));
}

TEST_F(ProxyModelsTest, WhatHasNoModelIsLoggedAndEmpty)
{
  Names logged;
  NMX::GlobalLog::SetSink(
      [&](const NMX::LogRecord& record)
      {
        logged.push_back(std::string(record.channel) + ' ' + std::to_string(static_cast<int>(record.severity)) + ' ' +
                         std::string(record.text));
      });
  const auto message = [](const char* text)
  { return Names{std::string("SubjectStoreUI.SubjectStoreProxyModel 2 ") + text}; };
  const auto nothing = NMX::MakeShared<VSubjectStoreProxyModel>(nullptr);
  EXPECT_EQ(std::exchange(logged, {}), message("Invalid parent QAbstractItemModel."));
  const ModelShadow shadow(*nothing);
  const auto sorted = Sorted(nothing);
  const ModelShadow sortedShadow(*sorted);
  EXPECT_EQ(nothing->rowCount() + nothing->columnCount() + nothing->roleNames().size(), 0);
  EXPECT_FALSE(nothing->index(0, 0).isValid());
  EXPECT_FALSE(nothing->setData({}, "x", Role::SubjectName));

  SetMarkers(Add(ESubjectKind::BasicObjects, "Crate"), 2);
  const auto list = NMX::MakeShared<Loose<VSubjectListModelStore>>(data);
  list->attached = {NMX::MakeShared<VSubjectElementModel>(data, *list)};
  const auto joined = NMX::MakeShared<VSubjectStoreProxyModel>(list);
  const ModelShadow joinedShadow(*joined);
  const QModelIndex subject = joined->index(0, 0);
  const QModelIndex lost = joined->index(1, 0, subject);
  EXPECT_EQ(NameOf(lost), "Marker 2");
  list->attached.clear();
  joinedShadow.Check();
  EXPECT_THAT(logged, IsEmpty());
  const auto expectFailure = [&](bool empty, const char* text)
  {
    EXPECT_TRUE(empty) << text;
    EXPECT_EQ(std::exchange(logged, {}), message(text));
  };
  expectFailure(!joined->index(0, 0, lost).isValid(),
                "Failed to create index: parent index's internal data is invalid.");
  expectFailure(!joined->parent(lost).isValid(), "Failed to get parent index: index's internal data is invalid.");
  expectFailure(!joined->data(lost, Role::SubjectName).isValid(),
                "Failed to get data: index's internal data is invalid.");
  expectFailure(!joined->setData(lost, "x", Role::SubjectName),
                "Failed to set data: index's internal data is invalid.");
  expectFailure(joined->rowCount(lost) == 0, "Failed to get row count: parent index's internal data is invalid.");
  expectFailure(joined->columnCount(lost) == 0, "Failed to get column count: parent index's internal data is invalid.");
  expectFailure(joined->flags(lost) == Qt::NoItemFlags, "Failed to get flags: index's internal data is invalid.");
  EXPECT_EQ(NameOf(joined->index(0, 0)), "Crate");
  EXPECT_EQ(joined->rowCount(joined->index(0, 0)), 0);
  EXPECT_THAT(logged, IsEmpty());
  NMX::GlobalLog::SetSink(nullptr);

  // The base model goes with the proxy that is the last to hold it, and its element models with it.
  auto last = MakeList();
  Attach(*last);
  auto holder = NMX::MakeShared<VSubjectStoreProxyModel>(std::move(last));
  Recorder recorder(*holder);
  holder.reset();
  EXPECT_THAT(recorder.Take(), IsEmpty());
}

namespace
{

/// The joining model shows what its sources do, asked one by one.
void ExpectJoined(const VSubjectStoreProxyModel& joined, const VSubjectModelStoreBase& base)
{
  ASSERT_EQ(joined.rowCount(), base.subjectRowCount({}));
  for (int row = 0; row < joined.rowCount(); ++row)
  {
    const QModelIndex top = joined.index(row, 0);
    const QModelIndex baseTop = base.index(row, 0);
    ExpectSameRow(top, baseTop);
    int child = 0;
    for (; child < base.subjectRowCount(baseTop); ++child)
      ExpectSameRow(joined.index(child, 0, top), base.index(child, 0, baseTop));
    for (const auto& elements : base.elementModels())
      for (int element = 0; element < elements->rowCount(baseTop); ++element)
        ExpectSameRow(joined.index(child++, 0, top), elements->index(element, 0, baseTop));
    ASSERT_EQ(joined.rowCount(top), child);
  }
}

/// The order of the sorted model is that of a plain stable sort, at every level.
void ExpectSorted(const QSortFilterProxyModel& sorted, const QModelIndex& parent = {})
{
  const QAbstractItemModel& source = *sorted.sourceModel();
  const QModelIndex sourceParent = sorted.mapToSource(parent);
  std::vector<std::pair<std::string, int>> expected;
  for (int row = 0; row < source.rowCount(sourceParent); ++row)
    expected.emplace_back(source.index(row, 0, sourceParent).data(Role::SubjectProxySortName).toString().toStdString(),
                          row);
  std::stable_sort(expected.begin(), expected.end(),
                   [](const auto& a, const auto& b) { return NaturallyLess(a.first, b.first); });
  ASSERT_EQ(sorted.rowCount(parent), static_cast<int>(expected.size()));
  for (int row = 0; row < sorted.rowCount(parent); ++row)
  {
    const QModelIndex index = sorted.index(row, 0, parent);
    ASSERT_EQ(sorted.mapToSource(index).row(), expected[static_cast<std::size_t>(row)].second) << NameOf(index);
    ExpectSorted(sorted, index);
  }
}

/// Remembers rows by persistent index and by selection, and checks that both keep to their subjects.
class Marks
{
public:
  explicit Marks(QAbstractItemModel& model) : m_model(model), m_selection(&model) {}

  void Mark(int row)
  {
    const QModelIndex index = m_model.index(row, 0);
    m_selection.select(index, QItemSelectionModel::Select);
    m_marked.insert_or_assign(IdAt(index), index);
    if (m_model.rowCount(index) > 0)
      m_beneath.emplace_back(m_model.index(m_model.rowCount(index) - 1, 0, index), IdAt(index));
  }

  void Check(const VSubjectModelStoreBase& base)
  {
    int selected = 0;
    for (const QModelIndex& index : m_selection.selectedIndexes())
    {
      ASSERT_TRUE(m_marked.contains(IdAt(index))) << NameOf(index);
      ++selected;
    }
    for (auto mark = m_marked.begin(); mark != m_marked.end();)
    {
      const QModelIndex row = base.indexForSubject(mark->first);
      const bool isThere = row.isValid() && !row.parent().isValid();
      ASSERT_EQ(mark->second.isValid(), isThere && !wasReset);
      if (!mark->second.isValid())
      {
        mark = m_marked.erase(mark);
        continue;
      }
      ASSERT_EQ(IdAt(mark->second), mark->first);
      --selected;
      ++mark;
    }
    EXPECT_EQ(selected, 0) << "what is selected is what was";
    for (const auto& [index, parent] : m_beneath)
      ASSERT_TRUE(!index.isValid() || IdAt(index.parent()) == parent);
    wasReset = false;
  }

  bool wasReset = false;

private:
  QAbstractItemModel& m_model;
  QItemSelectionModel m_selection;
  std::map<NMX::TSubjectStoreId, QPersistentModelIndex> m_marked;
  std::vector<std::pair<QPersistentModelIndex, NMX::TSubjectStoreId>> m_beneath;
};

}

TEST_F(ProxyModelsTest, RandomEditsPassThroughBothProxies)
{
  const std::shared_ptr<VSubjectModelStoreBase> bases[] = {MakeList(), MakeTree(ESubjectKind::BasicObjects),
                                                           MakeSlotTree()};
  for (const auto& base : bases)
  {
    const auto joined = NMX::MakeShared<VSubjectStoreProxyModel>(base);
    const auto sorted = Sorted(joined);
    ModelShadow shadow(*joined, Untold(*base));
    ModelShadow sortedShadow(*sorted, Untold(*base));
    Marks marks(*sorted);
    QObject::connect(sorted.get(), &QAbstractItemModel::modelReset, sorted.get(), [&] { marks.wasReset = true; });
    RandomStoreEdits edits(20261122);
    for (int step = 0; step < 7000; ++step)
    {
      edits.Transaction(*store);
      if (step % 3 != 0)
        continue;
      base->refresh();
      for (auto count = base->elementModels().size(); count < 2 && base->subjectRowCount({}) > 0; ++count)
        Attach(*base);
      if (step % 12 != 0)
        continue;
      sortedShadow.Check();
      QCoreApplication::processEvents();
      ExpectJoined(*joined, *base);
      ExpectSorted(*sorted);
      shadow.Check();
      sortedShadow.Check();
      marks.Check(*base);
      if (sorted->rowCount() > 0)
        marks.Mark(edits.Below(sorted->rowCount()));
      if (HasFailure())
        FAIL() << "step " << step;
    }
    EXPECT_GT(shadow.resets, 1);
    EXPECT_GT(shadow.removals, 300);
    EXPECT_GT(shadow.inserts, 300);
  }
}
