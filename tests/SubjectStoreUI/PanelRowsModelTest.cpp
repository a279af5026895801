#include "SubjectStoreUI/VPanelRowsModel.h"
#include "SubjectStoreUI/VSubjectElementModel.h"
#include "SubjectStoreUI/VSubjectStoreProxyModel.h"
#include "tests/Support/ModelFixture.h"
#include "tests/Support/ModelShadow.h"
#include "tests/Support/RandomStoreEdits.h"

#include <QSignalSpy>

#include <gmock/gmock.h>

#include <deque>
#include <map>
#include <set>
#include <utility>

using namespace SubjectStoreUI;
using NMX::ESubjectKind;
using testing::ElementsAre;
using testing::IsEmpty;
namespace Paths = NMX::Paths;
namespace Role = SubjectsModelRole;
namespace Own = PanelRowsRole;

namespace
{

QVariant Gadget(std::uint64_t id)
{
  return QVariant::fromValue(VStoreIdGadget(NMX::TSubjectStoreId(id)));
}

QString KindOf(const QModelIndex& row)
{
  return row.data(Own::RowKind).toString();
}

/// A row as a line: what it is, by the list, and its name.
std::string Line(const QModelIndex& row)
{
  QString text;
  QDebug debug(&text);
  debug.nospace().noquote() << QString(row.data(Own::Depth).toInt() * 2, ' ') << KindOf(row) << ' '
                            << row.data(Own::Section).toInt() << ' ' << row.data(Role::SubjectName).toString() << ' '
                            << row.data(Own::MatchCount).toInt() << '/' << row.data(Own::Count).toInt() << " w"
                            << row.data(Own::WarningCount).toInt() << " e" << row.data(Own::Element).toInt() << ' '
                            << row.data(Own::ParentName).toString() << ' '
                            << row.data(Own::ParentStoreId).value<VStoreIdGadget>().toString() << ' '
                            << row.data(Own::Expandable).toBool() << row.data(Own::Expanded).toBool();
  return text.toStdString();
}

Names Lines(const QAbstractItemModel& model)
{
  Names lines;
  for (int row = 0; row < model.rowCount(); ++row)
    lines.push_back(Line(model.index(row, 0)));
  return lines;
}

/// What a view knows that was told of rows, moves, and sorts, where it trusts the persistent indexes.
class ListShadow
{
public:
  explicit ListShadow(QAbstractItemModel& model)
      : m_model(model), m_tester(&model, QAbstractItemModelTester::FailureReportingMode::Fatal)
  {
    for (int row = 0; row < model.rowCount(); ++row)
      m_rows.push_back(Read(row));
    using M = QAbstractItemModel;
    const auto on = [&](auto signal, auto slot) { QObject::connect(&model, signal, &m_context, slot); };
    on(&M::rowsInserted, [this](const QModelIndex&, int first, int last) { Insert(first, last); });
    on(&M::rowsRemoved,
       [this](const QModelIndex&, int first, int last)
       {
         told.push_back("remove " + std::to_string(first) + '-' + std::to_string(last));
         m_rows.erase(m_rows.begin() + first, m_rows.begin() + last + 1);
       });
    on(&M::rowsMoved,
       [this](const QModelIndex&, int first, int last, const QModelIndex&, int to)
       {
         told.push_back("move " + std::to_string(first) + '-' + std::to_string(last) + " to " + std::to_string(to));
         const auto rows = m_rows.begin();
         to < first ? std::rotate(rows + to, rows + first, rows + last + 1)
                    : std::rotate(rows + first, rows + last + 1, rows + to);
       });
    on(&M::layoutAboutToBeChanged,
       [this]
       {
         for (int row = 0; row < m_model.rowCount(); ++row)
           m_kept.emplace_back(m_model.index(row, 0));
       });
    on(&M::layoutChanged,
       [this]
       {
         told.emplace_back("sort");
         auto before = std::exchange(m_rows, std::vector<Values>(m_rows.size()));
         for (std::size_t row = 0; row < before.size(); ++row)
           m_rows.at(static_cast<std::size_t>(m_kept[row].row())) = std::move(before[row]);
         m_kept.clear();
       });
    on(&M::dataChanged, [this](const QModelIndex& first, const QModelIndex& last, const QList<int>& roles)
       { Change(first.row(), last.row(), roles); });
    on(&M::modelReset, [this] { told.emplace_back("reset"); });
  }

  /// The list says what was told of it.
  void Check() const
  {
    ASSERT_EQ(static_cast<int>(m_rows.size()), m_model.rowCount());
    for (std::size_t row = 0; row < m_rows.size(); ++row)
    {
      const QModelIndex index = m_model.index(static_cast<int>(row), 0);
      const Values asked = Read(index.row());
      const bool isElement = KindOf(index) == "element";
      for (auto value = asked.begin(); value != asked.end(); ++value)
      {
        const bool untold = value.key() == Role::SubjectSmartClusterDeviceNames || value.key() == Role::SubjectPatterns;
        ASSERT_TRUE((untold && !isElement) || value.value() == m_rows[row].value(value.key()))
            << "role " << value.key() << " of " << Line(index);
      }
    }
  }

  /// Within a burst a row answers for what was told, or says nothing.
  void CheckNoneIsAnother() const
  {
    for (std::size_t row = 0; row < m_rows.size(); ++row)
    {
      const QModelIndex index = m_model.index(static_cast<int>(row), 0);
      const QVariant id = index.data(Role::SubjectStoreId);
      ASSERT_TRUE(!id.isValid() || id == m_rows[row].value(Role::SubjectStoreId)) << Line(index);
      const QVariant isElement = index.data(Role::SubjectIsSubjectElement);
      ASSERT_TRUE(!isElement.isValid() || isElement == m_rows[row].value(Role::SubjectIsSubjectElement));
    }
  }

  [[nodiscard]] Names Take() { return std::exchange(told, {}); }

  Names told;

private:
  using Values = QHash<int, QVariant>;

  [[nodiscard]] static QList<int> AllRoles()
  {
    QList<int> roles = Role::All();
    for (const auto& key : Own::keys)
      roles.append(key.role);
    return roles;
  }

  [[nodiscard]] Values Read(int row) const
  {
    Values values;
    for (const int role : AllRoles())
      values.insert(role, m_model.index(row, 0).data(role));
    return values;
  }

  void Insert(int first, int last)
  {
    told.push_back("insert " + std::to_string(first) + '-' + std::to_string(last));
    std::vector<Values> rows;
    for (int row = first; row <= last; ++row)
      rows.push_back(Read(row));
    m_rows.insert(m_rows.begin() + first, rows.begin(), rows.end());
  }

  void Change(int first, int last, const QList<int>& roles)
  {
    std::string text = "change " + std::to_string(first) + '-' + std::to_string(last) + ':';
    for (const int role : roles)
      text += ' ' + m_model.roleNames().value(role).toStdString();
    told.push_back(roles.size() > 9 ? text.substr(0, text.find(':')) + ": many" : text);
    for (int row = first; row <= last; ++row)
      for (const int role : roles.isEmpty() ? AllRoles() : roles)
        m_rows.at(static_cast<std::size_t>(row))[role] = m_model.index(row, 0).data(role);
  }

  QAbstractItemModel& m_model;
  QAbstractItemModelTester m_tester;
  QObject m_context;
  std::vector<Values> m_rows;
  std::vector<QPersistentModelIndex> m_kept;
};

/// The list as somebody would make it who starts anew each time.
struct PlainList
{
  struct Section
  {
    const VSortSubjectsProxyModel* model;
    const VSubjectWarningSummary* summary;
    std::set<NMX::TSubjectStoreId> expanded{};
    std::set<NMX::TSubjectStoreId> closedSubjects{};
    bool collapsed = false;
    bool closed = false;
  };

  [[nodiscard]] bool Matches(const QModelIndex& row) const
  {
    QStringList names{row.data(Role::SubjectName).toString()};
    if (row.parent().isValid())
      names << row.data(Role::SubjectSlotName).toString();
    if (row.data(Role::SubjectIsSubjectElement).toBool())
      names << row.data(Role::SubjectSmartClusterDeviceNames).toStringList();
    for (const QString& name : names)
    {
      bool all = true;
      for (const QString& word : search.split(' ', Qt::SkipEmptyParts))
        all = all && name.contains(word, Qt::CaseInsensitive);
      if (all)
        return true;
    }
    return false;
  }

  void Make()
  {
    lines.clear();
    total = shown = 0;
    for (std::size_t section = 0; section < sections.size(); ++section)
      MakeSection(static_cast<int>(section), sections[section]);
  }

  void MakeSection(int number, const Section& section)
  {
    Names made;
    int matches = 0;
    const int count = section.model->rowCount();
    for (int row = 0; row < count; ++row)
      matches += MakeSubject(number, section, section.model->index(row, 0), made);
    const bool searching = !search.isEmpty();
    const bool open = !section.collapsed || (searching && matches > 0 && !section.closed);
    total += count;
    shown += matches;
    lines.push_back(Text("section", number, {}, matches, count, section.summary->totalWarningCount(), -1, {}, open));
    if (open)
      lines.insert(lines.end(), made.begin(), made.end());
  }

  bool MakeSubject(int number, const Section& section, const QModelIndex& subject, Names& made) const
  {
    const auto warnings = [](const QModelIndex& row)
    { return static_cast<int>(row.data(Role::SubjectWarnings).toList().size()); };
    const bool searching = !search.isEmpty();
    const bool itself = Matches(subject);
    bool warned = warnings(subject) > 0;
    bool found = false;
    std::map<QString, int> elements;
    Names beneath;
    const int count = section.model->rowCount(subject);
    for (int place = 0; place < count; ++place)
    {
      const QModelIndex row = section.model->index(place, 0, subject);
      const bool isElement = row.data(Role::SubjectIsSubjectElement).toBool();
      const int element =
          isElement ? elements[row.data(Role::SubjectSmartAndBasicMarkers).isValid() ? "marker" : "cluster"]++ : -1;
      warned = warned || warnings(row) > 0;
      found = found || (searching && Matches(row));
      const QString kind = isElement ? "element" : row.data(Role::SubjectSlotName).isValid() ? "slot" : "child";
      if (itself || Matches(row))
        beneath.push_back(Text(kind, number, row, 0, 0, warnings(row), element, subject, false));
    }
    if ((!itself && !found) || (onlyWarnings && !warned))
      return false;
    const bool open =
        section.expanded.contains(IdAt(subject)) || (found && !section.closedSubjects.contains(IdAt(subject)));
    made.push_back(
        Text("subject", number, subject, static_cast<int>(beneath.size()), count, warnings(subject), -1, {}, open));
    if (open)
      made.insert(made.end(), beneath.begin(), beneath.end());
    return true;
  }

  [[nodiscard]] static std::string Text(const QString& kind, int section, const QModelIndex& row, int matches,
                                        int count, int warnings, int element, const QModelIndex& above, bool open)
  {
    QString text;
    QDebug debug(&text);
    const int depth = kind == "section" ? 0 : kind == "subject" ? 1 : 2;
    const VStoreIdGadget id = above.data(Role::SubjectStoreId).value<VStoreIdGadget>();
    debug.nospace().noquote() << QString(depth * 2, ' ') << kind << ' ' << section << ' '
                              << row.data(Role::SubjectName).toString() << ' ' << matches << '/' << count << " w"
                              << warnings << " e" << element << ' ' << above.data(Role::SubjectName).toString() << ' '
                              << id.toString() << ' ' << (matches > 0) << open;
    return text.toStdString();
  }

  std::vector<Section> sections;
  QString search;
  bool onlyWarnings = false;
  Names lines;
  int total = 0;
  int shown = 0;
};

void RunEvents()
{
  for (int times = 0; times < 4; ++times)
    QCoreApplication::processEvents();
}

/// Subjects that a test makes up, with something beneath them. All rows have a name and an id, and are sorted by name.
class Texts : public QAbstractItemModel
{
public:
  struct Item
  {
    QHash<int, QVariant> values;
    std::vector<Item*> beneath;
  };

  [[nodiscard]] QModelIndex index(int row, int column, const QModelIndex& parent = {}) const override
  {
    return row < rowCount(parent) && column == 0 ? createIndex(row, 0, ItemAt(parent)) : QModelIndex{};
  }
  [[nodiscard]] QModelIndex parent(const QModelIndex& index) const override
  {
    const auto* above = static_cast<const Item*>(index.constInternalPointer());
    for (int row = 0; above != &m_root && row < rowCount(); ++row)
      if (m_root.beneath[static_cast<std::size_t>(row)] == above)
        return createIndex(row, 0, &m_root);
    return {};
  }
  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override
  {
    return static_cast<int>(ItemAt(parent)->beneath.size());
  }
  [[nodiscard]] int columnCount(const QModelIndex& /*parent*/) const override { return 1; }
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override
  {
    ++reads;
    return ItemAt(index)->values.value(role);
  }
  bool setData(const QModelIndex& index, const QVariant& value, int role) override
  {
    ItemAt(index)->values[role] = value;
    if (role == Role::SubjectName)
      ItemAt(index)->values[Role::SubjectProxySortName] = value;
    Q_EMIT dataChanged(index, index,
                       role == Role::SubjectName ? QList<int>{role, Role::SubjectProxySortName} : QList{role});
    return true;
  }

  void SetQuietly(const QModelIndex& index, const QString& name)
  {
    ItemAt(index)->values[Role::SubjectName] = name;
    ItemAt(index)->values[Role::SubjectProxySortName] = name;
  }
  QModelIndex Insert(int row, const QString& name, std::uint64_t id, const QModelIndex& parent = {})
  {
    beginInsertRows(parent, row, row);
    Item& item = m_items.emplace_back();
    item.values = {{Role::SubjectName, name}, {Role::SubjectProxySortName, name}, {Role::SubjectStoreId, Gadget(id)}};
    auto& rows = ItemAt(parent)->beneath;
    rows.insert(rows.begin() + row, &item);
    endInsertRows();
    return index(row, 0, parent);
  }
  void Remove(int row, const QModelIndex& parent = {})
  {
    beginRemoveRows(parent, row, row);
    auto& rows = ItemAt(parent)->beneath;
    rows.erase(rows.begin() + row);
    endRemoveRows();
  }
  /// Another order, or another content, without a word of what has become of the rows.
  void Reverse(bool reset)
  {
    if (reset)
      beginResetModel();
    else
      Q_EMIT layoutAboutToBeChanged();
    std::reverse(m_root.beneath.begin(), m_root.beneath.end());
    if (reset)
      return endResetModel();
    for (const QModelIndex& index : persistentIndexList())
      if (!index.parent().isValid())
        changePersistentIndex(index, createIndex(rowCount() - 1 - index.row(), 0, &m_root));
    Q_EMIT layoutChanged();
  }

  mutable int reads = 0;

private:
  [[nodiscard]] Item* ItemAt(const QModelIndex& index) const
  {
    if (!index.isValid())
      return &m_root;
    return static_cast<const Item*>(index.constInternalPointer())->beneath[static_cast<std::size_t>(index.row())];
  }

  mutable Item m_root;
  std::deque<Item> m_items; // also those that have gone
};

class PanelRowsModelTest : public ModelFixture
{
protected:
  VSortSubjectsProxyModel& AddSection(std::shared_ptr<QAbstractItemModel> source, ESubjectKind kind)
  {
    sections.push_back(
        std::make_unique<VSortSubjectsProxyModel>(std::move(source), VSubjectTypeGadget(kind), "Name", &summary));
    return *sections.back();
  }

  VSortSubjectsProxyModel& Join(const std::shared_ptr<VSubjectModelStoreBase>& base, ESubjectKind kind)
  {
    bases.push_back(base);
    Attach(*base);
    return AddSection(NMX::MakeShared<VSubjectStoreProxyModel>(base), kind);
  }

  void Attach(VSubjectModelStoreBase& base)
  {
    base.attachElementModel(NMX::MakeShared<VSubjectElementModel>(data, base));
  }

  void Refresh()
  {
    for (const auto& base : bases)
      base->refresh();
  }

  [[nodiscard]] QList<VSortSubjectsProxyModel*> Sections() const
  {
    QList<VSortSubjectsProxyModel*> all;
    for (const auto& section : sections)
      all.append(section.get());
    return all;
  }

  /// The names alone, indented, each section as the count of its matches.
  static Names Shown(const QAbstractItemModel& model)
  {
    Names names;
    for (int row = 0; row < model.rowCount(); ++row)
    {
      const QModelIndex index = model.index(row, 0);
      const std::string indent(static_cast<std::size_t>(index.data(Own::Depth).toInt()), ' ');
      names.push_back(KindOf(index) == "section" ? index.data(Own::MatchCount).toString().toStdString()
                      : KindOf(index) == "slot"  ? indent + index.data(Role::SubjectSlotName).toString().toStdString()
                                                 : indent + NameOf(index));
    }
    return names;
  }

  std::vector<std::shared_ptr<VSubjectModelStoreBase>> bases;
  std::vector<std::unique_ptr<VSortSubjectsProxyModel>> sections;
};

}

TEST_F(PanelRowsModelTest, ASearchShowsWhatHoldsEveryWordInOneName)
{
  const Id ada = Add(ESubjectKind::CharactersFromClusters, "Ada");
  const Id glove = Add(ESubjectKind::SmartObjects, "Red Glove");
  Set(ada, Paths::Slots(), std::vector<NMX::Slot>{{Id(1), "LeftHand"}, {Id(2), "pelvis"}});
  Set(glove, Paths::ParentSubjectId(), ada);
  Set(glove, Paths::ParentSubjectSlotId(), Id(1));
  Set(glove, Paths::SmartClusters(),
      std::vector<NMX::SmartCluster>{{"Grip", "corvex:77", 1, "C"}, {"Palm", "corvex:78", 2, "C"}});
  Add(ESubjectKind::SmartObjects, "Red wand");
  Set(glove, Paths::WarningObjectConfusion(), true);
  Join(MakeSlotTree(), ESubjectKind::CharactersFromClusters);
  Join(MakeTree(ESubjectKind::SmartObjects), ESubjectKind::SmartObjects);
  VPanelRowsModel model(Sections());
  const ListShadow shadow(model);
  const ModelShadow told(model);
  const Names all{"1", " Ada", "2", " Red Glove", " Red wand"};
  EXPECT_EQ(Shown(model), all);
  QSignalSpy counts(&model, &VPanelRowsModel::countsChanged);
  QSignalSpy searches(&model, &VPanelRowsModel::searchChanged);
  const struct
  {
    const char* search;
    Names shown;
  } cases[] = {{"RED", {"1", " Ada", "  LeftHand", "2", " Red Glove", " Red wand"}},
               {" wand  red ", {"0", "1", " Red wand"}},
               {"hand left", {"1", " Ada", "  LeftHand", "0"}},
               {"left glove", {"0", "0"}},
               {"ada", {"1", " Ada", "0"}},
               {"palm", {"0", "1", " Red Glove", "  Palm"}},
               {"Corvex:77", {"0", "1", " Red Glove", "  Grip"}},
               {"  ", all}};
  for (const auto& [search, shown] : cases)
  {
    model.setProperty("search", search);
    EXPECT_EQ(Shown(model), shown) << search;
    shadow.Check();
    told.Check();
  }
  EXPECT_EQ(searches.count(), 8);
  EXPECT_EQ(model.property("shownCount"), QVariant(3));
  model.setSearch("nothing");
  EXPECT_EQ(model.index(1, 0).data(Own::Count), QVariant(2)) << "nothing of two";
  EXPECT_EQ(model.property("shownCount"), QVariant(0));
  EXPECT_EQ(model.property("totalCount"), QVariant(3));
  model.setSearch("");
  counts.clear();
  model.setProperty("onlyWarnings", true);
  EXPECT_THAT(Shown(model), ElementsAre("1", " Ada", "1", " Red Glove")) << "also those with a warning beneath";
  EXPECT_EQ(counts.count(), 1);
  model.setSearch("wand");
  EXPECT_THAT(Shown(model), ElementsAre("0", "0"));

  // What comes to match is shown, and what no longer does is not.
  model.setOnlyWarnings(false);
  Change([&](NMX::IEntryEditor& editor)
         { EXPECT_TRUE(editor.Rename(glove, "Wand 2", NMX::ENotify::Yes).Succeeded()); });
  Refresh();
  RunEvents();
  EXPECT_THAT(Shown(model), ElementsAre("1", " Ada", "  LeftHand", "2", " Red wand", " Wand 2"));
  Set(glove, Paths::SmartClusters(), std::vector<NMX::SmartCluster>{{"Wand tip", "", 1, "C"}});
  Set(glove, Paths::Enabled(), false);
  Refresh();
  RunEvents();
  EXPECT_THAT(Shown(model), ElementsAre("1", " Ada", "  LeftHand", "2", " Red wand", " Wand 2", "  Wand tip"));
  shadow.Check();
}

TEST_F(PanelRowsModelTest, ExpansionIsRememberedBySubject)
{
  const auto texts = std::make_shared<Texts>();
  const auto make = [&] { texts->Insert(0, "Arm", 8, texts->Insert(0, "Body", 7)); };
  make();
  texts->Insert(1, "Crate", 9);
  AddSection(texts, ESubjectKind::Props);
  VPanelRowsModel model(Sections());
  const ListShadow shadow(model);
  const Names closed{"2", " Body", " Crate"};
  const Names open{"2", " Body", "  Arm", " Crate"};
  model.toggle(1);
  EXPECT_EQ(Shown(model), open);
  texts->Remove(0);
  RunEvents();
  EXPECT_THAT(Shown(model), ElementsAre("1", " Crate"));
  make();
  RunEvents();
  EXPECT_EQ(Shown(model), open) << "it came back";
  model.setSearch("crate");
  model.setSearch("");
  EXPECT_EQ(Shown(model), open);

  // What a search opens is not remembered; what it opened can be closed until another search.
  model.setExpanded(1, false);
  model.setSearch("arm");
  EXPECT_THAT(Shown(model), ElementsAre("1", " Body", "  Arm"));
  model.toggle(1);
  EXPECT_THAT(Shown(model), ElementsAre("1", " Body"));
  model.toggle(0);
  EXPECT_THAT(Shown(model), ElementsAre("1"));
  model.setSearch("ar");
  EXPECT_THAT(Shown(model), ElementsAre("1", " Body", "  Arm"));
  model.setSearch("");
  EXPECT_THAT(Shown(model), ElementsAre("2")) << "the section was collapsed by hand";

  // Looking for a row opens what is above it.
  const auto rowOf = [&](std::uint64_t id) { return model.rowOfSubject(VStoreIdGadget(NMX::TSubjectStoreId(id))); };
  EXPECT_EQ(rowOf(7), 1);
  EXPECT_EQ(Shown(model), closed);
  model.collapseAll();
  EXPECT_EQ(rowOf(8), 2);
  EXPECT_EQ(Shown(model), open);
  EXPECT_EQ(rowOf(1), -1);
  EXPECT_EQ(rowOf(0), -1);
  model.setSearch("crate");
  EXPECT_EQ(rowOf(8), -1) << "the search hides it";
  model.setSearch("");
  model.collapseAll();
  EXPECT_THAT(Shown(model), ElementsAre("2"));
  model.expandAll();
  EXPECT_EQ(Shown(model), open);
  for (const int row : {-1, 4, 99})
    model.toggle(row);
  model.toggle(2);
  EXPECT_EQ(Shown(model), open) << "there is nothing beneath a child";
  shadow.Check();
}

TEST_F(PanelRowsModelTest, RowsAreFoundAndEditedThroughTheList)
{
  const Id body = Add(ESubjectKind::BasicObjects, "Body");
  const Id arm = Add(ESubjectKind::BasicObjects, "Arm");
  Set(arm, Paths::ParentSubjectId(), body);
  Set(body, Paths::Markers(), std::vector<NMX::Position>{{1, 2, 3}, {4, 5, 6}});
  Join(MakeSlotTree(), ESubjectKind::CharactersFromClusters);
  Join(MakeTree(ESubjectKind::BasicObjects), ESubjectKind::BasicObjects);
  VPanelRowsModel model(Sections());
  ListShadow shadow(model);
  model.expandAll();
  EXPECT_THAT(Shown(model), ElementsAre("0", "2", " Arm", " Body", "  Marker 1", "  Marker 2", "  Arm"));
  EXPECT_EQ(model.rowOfSection("BasicObjects"), 1);
  EXPECT_EQ(model.rowOfSection("Props"), -1);
  const QVariantList both{Gadget(arm.Value()), Gadget(body.Value())};
  EXPECT_EQ(model.subjectsBetween(-5, 50), both);
  EXPECT_EQ(model.subjectsBetween(6, 3), QVariantList({both[1], both[0]}));
  EXPECT_THAT(model.subjectsBetween(4, 5), IsEmpty());
  EXPECT_TRUE(model.setData(model.index(6, 0), "Wing", Role::SubjectName));
  EXPECT_FALSE(model.setData(model.index(4, 0), "x", Role::SubjectName));
  EXPECT_FALSE(model.setData(model.index(1, 0), "x", Role::SubjectName));
  EXPECT_EQ(Get<std::string>(arm, Paths::Name()), "Wing");
  const auto names = model.roleNames();
  EXPECT_EQ(names.value(Role::SubjectName), "subjectName");
  for (const auto& [role, name] : {std::pair(300, "rowKind"),
                                   {301, "section"},
                                   {304, "depth"},
                                   {310, "element"},
                                   {311, "parentStoreId"},
                                   {313, "matchCount"}})
    EXPECT_EQ(names.value(role), name);
  EXPECT_EQ(model.index(1, 0).data(Own::SectionKey), QVariant("BasicObjects"));
  EXPECT_EQ(model.index(1, 0).data(Own::SectionName), QVariant("Name"));

  // The list's own values are told of as such, beside what the section tells.
  (void)shadow.Take();
  Refresh();
  RunEvents();
  EXPECT_THAT(shadow.Take(), ElementsAre("change 6-6: many", "change 2-2: many", "move 3-6 to 2"));
  Set(body, Paths::WarningObjectConfusion(), true);
  Refresh();
  RunEvents();
  EXPECT_THAT(shadow.Take(), ElementsAre("change 2-2: subjectWarnings", "change 0-0: warningCount sectionWarnings",
                                         "change 1-1: warningCount sectionWarnings", "change 2-2: warningCount"));
  Change([&](NMX::IEntryEditor& editor) { EXPECT_TRUE(editor.Rename(body, "Trunk", NMX::ENotify::Yes).Succeeded()); });
  Refresh();
  RunEvents();
  EXPECT_THAT(shadow.Take(), ElementsAre("change 2-2: many", "change 3-5: parentName"));
  shadow.Check();
}

TEST_F(PanelRowsModelTest, RowsOfABurstAreToldOfTogether)
{
  const auto texts = std::make_shared<Texts>();
  AddSection(texts, ESubjectKind::Props);
  AddSection(std::make_shared<Texts>(), ESubjectKind::Markerless);
  VPanelRowsModel model(Sections());
  ListShadow shadow(model);
  const auto name = [](int number) { return "Subject " + QString::number(number); };
  for (int number = 0; number < 10000; ++number)
    texts->Insert(number % 3 == 0 ? 0 : texts->rowCount(), name(number * 7919 % 10000),
                  static_cast<std::uint64_t>(number) + 1);
  RunEvents();
  EXPECT_THAT(shadow.Take(), ElementsAre("insert 1-10000", "change 0-0: expandable count matchCount"));
  EXPECT_EQ(NameOf(model.index(10000, 0)), "Subject 9999");
  shadow.Check();

  // A change of a value reads that row and no other.
  const auto at = [&](int row) { return sections[0]->index(row, 0); };
  texts->reads = 0;
  sections[0]->setData(at(5000), QVariantList{1}, Role::SubjectWarnings);
  RunEvents();
  EXPECT_THAT(shadow.Take(), ElementsAre("change 5001-5001: subjectWarnings", "change 5001-5001: warningCount"));
  EXPECT_LT(texts->reads, 100);

  // One that gets another name moves; persistent indexes and everything else stay.
  const QPersistentModelIndex moved = model.index(1, 0);
  sections[0]->setData(at(0), name(4000) + 'b', Role::SubjectName);
  RunEvents();
  EXPECT_THAT(shadow.Take(), ElementsAre("change 1-1: subjectName subjectProxySortName", "move 2-4001 to 1"));
  EXPECT_EQ(moved.row(), 4001);
  sections[0]->sort(0, Qt::DescendingOrder);
  RunEvents();
  EXPECT_THAT(shadow.Take(), ElementsAre("sort"));
  EXPECT_EQ(moved.row(), 6000);
  model.setSearch("0");
  EXPECT_THAT(shadow.Take().size(), testing::Lt(6U));
  model.setSearch("");
  EXPECT_THAT(shadow.Take().size(), testing::Lt(6U));
  shadow.Check();
  for (int row = 9999; row > 0; row -= 2)
    texts->Remove(row);
  RunEvents();
  EXPECT_THAT(shadow.Take().size(), testing::Lt(6U));
  EXPECT_EQ(model.totalCount(), 5000);
  shadow.Check();
}

TEST_F(PanelRowsModelTest, UntilItIsToldARowThatHasGoneSaysNothing)
{
  const auto texts = std::make_shared<Texts>();
  for (int number = 0; number < 6; ++number)
  {
    const QModelIndex subject =
        texts->Insert(number, QString("ABCDEF"[number]), static_cast<std::uint64_t>(number) + 1);
    for (int beneath = 0; beneath < 3; ++beneath)
      texts->Insert(beneath, QString("abc"[beneath]), static_cast<std::uint64_t>(beneath) + 10, subject);
  }
  AddSection(texts, ESubjectKind::Props);
  AddSection(std::make_shared<Texts>(), ESubjectKind::Markerless);
  // Somebody who hears of changes before the list does, and asks it.
  ListShadow* known = nullptr;
  const auto ask = [&]
  {
    if (known != nullptr)
      known->CheckNoneIsAnother();
  };
  QObject context;
  using M = QAbstractItemModel;
  for (const auto signal : {&M::rowsAboutToBeInserted, &M::rowsInserted, &M::rowsAboutToBeRemoved, &M::rowsRemoved})
    QObject::connect(sections[0].get(), signal, &context, ask);
  QObject::connect(sections[0].get(), &M::layoutAboutToBeChanged, &context, ask);
  QObject::connect(sections[0].get(), &M::layoutChanged, &context, ask);
  QObject::connect(sections[0].get(), &M::modelReset, &context, ask);
  VPanelRowsModel model(Sections());
  model.expandAll();
  ListShadow shadow(model);
  known = &shadow;
  QObject::connect(sections[0].get(), &M::rowsRemoved, &context, ask);

  const QModelIndex row = model.index(5, 0); // B
  texts->Remove(1);
  EXPECT_FALSE(row.data(Role::SubjectName).isValid());
  EXPECT_EQ(row.data(Own::RowKind), QVariant("subject"));
  EXPECT_FALSE(model.index(7, 0).data(Role::SubjectName).isValid()) << "nor what was beneath";
  EXPECT_FALSE(model.setData(row, "x", Role::SubjectName));
  EXPECT_FALSE(model.flags(row).testFlag(Qt::ItemIsEnabled));
  EXPECT_EQ(NameOf(model.index(9, 0)), "C");
  model.setExpanded(5, false);
  EXPECT_THAT(shadow.Take(), IsEmpty());
  RunEvents();
  EXPECT_THAT(shadow.Take(), ElementsAre("remove 5-8", "change 0-0: count matchCount", "change 1-20:"))
      << "the rows that were asked in vain, too";
  texts->Insert(0, "G", 7);
  texts->Insert(0, "aa", 20, texts->index(3, 0));
  texts->Remove(2, texts->index(3, 0));
  texts->Remove(5);
  shadow.CheckNoneIsAnother();
  RunEvents();
  shadow.Check();
  EXPECT_THAT(Shown(model), ElementsAre("5", " A", "  a", "  b", "  c", " C", "  a", "  b", "  c", " D", "  a", "  aa",
                                        "  c", " E", "  a", "  b", "  c", " G", "0"));

  // Another content: what can be recognised stays.
  const QPersistentModelIndex kept = model.index(9, 0);
  const QPersistentModelIndex keptBeneath = model.index(12, 0);
  (void)shadow.Take();
  texts->Reverse(false);
  shadow.CheckNoneIsAnother();
  texts->Reverse(true);
  texts->Insert(0, "H", 8);
  shadow.CheckNoneIsAnother();
  RunEvents();
  EXPECT_EQ(NameOf(kept), "D");
  EXPECT_EQ(NameOf(keptBeneath), "c");
  // A sort reads names that nobody has been told of yet.
  texts->SetQuietly(sections[0]->mapToSource(sections[0]->index(2, 0, sections[0]->index(2, 0))), "0");
  sections[0]->sort(0);
  RunEvents();
  EXPECT_EQ(NameOf(keptBeneath), "0");
  EXPECT_EQ(keptBeneath.row(), 10);
  EXPECT_THAT(shadow.told, testing::Not(testing::Contains("reset")));
  shadow.Check();
  sections[0].reset();
  shadow.CheckNoneIsAnother();
  EXPECT_THAT(model.subjectsBetween(0, 99), IsEmpty());
  RunEvents();
  EXPECT_THAT(Shown(model), ElementsAre("0"));
  EXPECT_EQ(model.index(0, 0).data(Own::Section), QVariant(1));
  EXPECT_EQ(model.totalCount(), 0);
  shadow.Check();
}

TEST_F(PanelRowsModelTest, RandomEditsAreShownAsInAPlainList)
{
  Join(MakeList(), ESubjectKind::Props);
  Join(MakeTree(ESubjectKind::BasicObjects), ESubjectKind::BasicObjects);
  Join(MakeSlotTree(), ESubjectKind::CharactersFromClusters);
  VPanelRowsModel model(Sections());
  ListShadow shadow(model);
  const ModelShadow told(model, {Role::SubjectSmartClusterDeviceNames, Role::SubjectPatterns});
  PlainList plain;
  for (const auto& section : sections)
    plain.sections.push_back({section.get(), &summary});
  RandomStoreEdits edits(20261123);
  const char* searches[] = {"", "", "", "a", "B1", "slot 1", "marker", "1 a", "b2"};
  std::map<std::string, std::size_t> seen;
  std::vector<std::pair<QPersistentModelIndex, std::pair<QVariant, QVariant>>> marks;
  const auto identity = [](const QModelIndex& row)
  {
    return std::pair(row.data(Own::ParentStoreId), KindOf(row) == "slot" ? QVariant() : row.data(Role::SubjectStoreId));
  };
  const auto expand = [&](int row, bool open)
  {
    const QModelIndex index = model.index(row, 0);
    PlainList::Section& section = plain.sections[index.data(Own::Section).toUInt()];
    const bool searching = !plain.search.isEmpty();
    if (KindOf(index) == "section")
      section.collapsed = !open, section.closed = !open && searching;
    else if (KindOf(index) == "subject" && open)
      section.expanded.insert(IdAt(index)), section.closedSubjects.erase(IdAt(index));
    else if (KindOf(index) == "subject")
    {
      section.expanded.erase(IdAt(index));
      if (searching)
        section.closedSubjects.insert(IdAt(index));
    }
    model.setExpanded(row, open);
  };
  const auto act = [&]
  {
    const int row = edits.Below(model.rowCount());
    switch (edits.Below(6))
    {
    case 0:
      plain.search = searches[edits.Below(9)];
      for (auto& section : plain.sections)
        if (plain.search != model.search())
          section.closed = false, section.closedSubjects.clear();
      return model.setSearch(plain.search);
    case 1:
      plain.onlyWarnings = edits.Below(4) == 0;
      return model.setOnlyWarnings(plain.onlyWarnings);
    default:
      if (model.index(row, 0).data(Role::SubjectStoreId).isValid() || KindOf(model.index(row, 0)) == "section")
        expand(row, edits.Below(5) != 0);
    }
  };
  for (int step = 0; step < 7000; ++step)
  {
    edits.Transaction(*store);
    if (step % 3 != 0)
      continue;
    Refresh();
    for (const auto& base : bases)
      if (base->elementModels().empty() && base->subjectRowCount({}) > 0)
        Attach(*base);
    shadow.CheckNoneIsAnother();
    act();
    if (step % 2 != 0)
      continue;
    RunEvents();
    plain.Make();
    ASSERT_EQ(Lines(model), plain.lines) << "step " << step << " search " << plain.search.toStdString();
    ASSERT_EQ(model.totalCount(), plain.total);
    ASSERT_EQ(model.shownCount(), plain.shown);
    shadow.Check();
    for (const auto& [row, was] : marks)
      ASSERT_TRUE(!row.isValid() || identity(row) == was) << Line(row) << " at step " << step;
    std::erase_if(marks, [](const auto& mark) { return !mark.first.isValid(); });
    const QModelIndex marked = model.index(edits.Below(model.rowCount()), 0);
    if (marks.size() < 40)
      marks.emplace_back(marked, identity(marked));
    for (const std::string& signal : shadow.Take())
      ++seen[signal.substr(0, 4)];
    if (HasFailure())
      FAIL() << "step " << step;
  }
  EXPECT_EQ(seen["rese"], 0U);
  for (const char* signal : {"inse", "remo", "move", "chan"})
    EXPECT_GT(seen[signal], 200U) << signal;
}
