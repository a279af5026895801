#pragma once

#include "SubjectStoreUI/RankedRows.h"
#include "SubjectStoreUI/VSubjectModelStoreBase.h"

#include <QThread>

#include <algorithm>
#include <utility>

namespace SubjectStoreUI
{

/// What the two trees have in common: subjects of one kind at the top, in ascending order of their ids, and beneath
/// each what the derived model finds there. `Item` stands behind a row of either level and the index points at it; it
/// has Subject() and TopLevel(), which tells which of the levels it is of, and is made from a top-level subject.
/// `ChildRows` are the rows beneath a subject; `ChildChange` is what a refresh has learnt of one, with its `key`, its
/// `subject` (the invalid id for none) and its `aspects`. [gui]
template <class Item, class ChildRows, class ChildChange>
class SubjectTree : public VSubjectModelStoreBase
{
public:
  [[nodiscard]] QModelIndex index(int row, int column, const QModelIndex& parent = {}) const override
  {
    if (row < 0 || column != 0)
      return {};
    if (!parent.isValid())
      return row < m_nodes.Count() ? createIndex(row, column, static_cast<const Item*>(&m_nodes.At(row)))
                                   : QModelIndex{};
    const Node* node = NodeOf(parent);
    return node != nullptr && row < node->children.Count()
               ? createIndex(row, column, static_cast<const Item*>(&node->children.At(row)))
               : QModelIndex{};
  }

  using QObject::parent;
  [[nodiscard]] QModelIndex parent(const QModelIndex& index) const override
  {
    const Item* item = ItemOf(index);
    return item != nullptr && !item->TopLevel() ? TopLevelIndex(item->Parent()) : QModelIndex{};
  }

  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override
  {
    if (!parent.isValid())
      return m_nodes.Count();
    const Node* node = NodeOf(parent);
    return node != nullptr ? node->children.Count() : 0;
  }

  [[nodiscard]] int subjectRowCount(const QModelIndex& parent) const override { return rowCount(parent); }

  bool setData(const QModelIndex& index, const QVariant& value, int role) override
  {
    const Item* item = ItemOf(index);
    return item != nullptr && item->Subject().Valid() && WriteRole(item->Subject(), value, role);
  }

  [[nodiscard]] QModelIndex indexForSubject(NMX::TSubjectStoreId subject) const override
  {
    if (const QModelIndex top = TopLevelIndex(subject); top.isValid())
      return top;
    for (auto cursor = m_nodes.Begin(); cursor != m_nodes.End(); ++cursor)
      for (int row = 0; row < cursor->children.Count(); ++row)
        if (const Item& item = cursor->children.At(row); item.Subject() == subject)
          return createIndex(row, 0, &item);
    return {};
  }

  void refresh() override
  {
    Q_ASSERT(thread() == QThread::currentThread());
    SeenStamps seen = Seen();
    const std::vector<Change> now = Gather(seen);
    bool rowsChanged = true;
    if (now.empty() && !m_nodes.Empty())
    {
      Reset([this] { m_nodes.Clear(); });
      seen = {};
    }
    else
    {
      bool childrenChanged = false;
      rowsChanged = Synchronise(
          {}, m_nodes, now,
          [&](Node& node, int row, const Change& change)
          {
            const QModelIndex index = createIndex(row, 0, static_cast<const Item*>(&node));
            TellChanged(index, TreeRoles(change.aspects));
            if (change.childrenChanged || !Same(node.children, change.children))
              childrenChanged = UpdateChildren(index, node, change) || childrenChanged;
          },
          [](Nodes& nodes, typename Nodes::Cursor before, const Change& change)
          { return nodes.Insert(before, change.key); }, [this](Node& node, int row, const Change& change)
          { FillChildren(createIndex(row, 0, static_cast<const Item*>(&node)), node, change); });
      rowsChanged = rowsChanged || childrenChanged;
    }
    Remember(seen, rowsChanged,
             [this](const NMX::IStoreReader& access, std::map<int, int>& topLevel, std::map<int, int>& children)
             {
               for (auto cursor = m_nodes.Begin(); cursor != m_nodes.End(); ++cursor)
               {
                 CountWarnings(access, cursor->Subject(), topLevel);
                 for (int row = 0; row < cursor->children.Count(); ++row)
                   if (const auto subject = cursor->children.At(row).Subject(); subject.Valid())
                     CountWarnings(access, subject, children);
               }
             });
    RefreshElements();
  }

protected:
  SubjectTree(std::shared_ptr<ISubjectModelInternalData> data, NMX::ESubjectKind filter,
              VSubjectWarningSummary* summary)
      : VSubjectModelStoreBase(std::move(data), summary), m_filter(filter)
  {
  }

  [[nodiscard]] const Item* ItemOf(const QModelIndex& index) const
  {
    return index.isValid() && index.model() == this ? static_cast<const Item*>(index.internalPointer()) : nullptr;
  }

  /// What is beneath a subject now. The stamps of subjects there are folded into `seen`.
  [[nodiscard]] virtual std::vector<ChildChange>
  GatherChildren(const NMX::IStoreReader& access, NMX::TSubjectStoreId subject, SeenStamps& seen) const = 0;

  /// Inserts the row of something beneath a subject.
  virtual typename ChildRows::Cursor InsertChild(ChildRows& rows, typename ChildRows::Cursor before,
                                                 NMX::TSubjectStoreId parent, const ChildChange& change) = 0;

  /// Brings what stands behind a row beneath a subject up to date, and answers which roles have changed.
  virtual QList<int> UpdateChild(Item& item, int row, const ChildChange& change) = 0;

  /// The roles that may have changed; nothing tells trees of devices.
  static QList<int> TreeRoles(ChangedAspects aspects)
  {
    aspects.devices = false;
    return aspects.Roles();
  }

private:
  struct Node : Item
  {
    explicit Node(NMX::TSubjectStoreId subject) : Item(subject) {}
    ChildRows children;
  };
  using Nodes = RankedRows<Node>;

  struct Change
  {
    NMX::TSubjectStoreId key;
    ChangedAspects aspects;
    bool childrenChanged = false;
    std::vector<ChildChange> children;
  };

  [[nodiscard]] const Node* NodeOf(const QModelIndex& index) const
  {
    const Item* item = ItemOf(index);
    return item != nullptr && item->TopLevel() ? static_cast<const Node*>(item) : nullptr;
  }

  [[nodiscard]] QModelIndex TopLevelIndex(NMX::TSubjectStoreId subject) const
  {
    const Node* node = m_nodes.Find(subject);
    return node != nullptr ? createIndex(m_nodes.PositionOf(subject), 0, static_cast<const Item*>(node))
                           : QModelIndex{};
  }

  [[nodiscard]] std::vector<Change> Gather(SeenStamps& seen) const
  {
    std::vector<Change> changes;
    const auto access = Data()->OpenRead();
    const auto subjects = Data()->Subjects(*access, {&m_filter, 1});
    changes.reserve(subjects.size());
    for (const NMX::TSubjectStoreId subject : subjects)
    {
      NMX::ChangeStamps stamps{};
      if (access->Stamps(subject, stamps).Failed())
        continue;
      seen.Fold(stamps);
      Change change{subject, ChangedAspects(stamps, Seen()), false, GatherChildren(*access, subject, seen)};
      change.childrenChanged = std::any_of(change.children.begin(), change.children.end(),
                                           [](const ChildChange& child) { return child.aspects.Any(); });
      changes.push_back(std::move(change));
    }
    return changes;
  }

  static bool Same(const ChildRows& rows, const std::vector<ChildChange>& now)
  {
    auto cursor = rows.Begin();
    return static_cast<std::size_t>(rows.Count()) == now.size() &&
           std::all_of(now.begin(), now.end(),
                       [&](const ChildChange& change)
                       {
                         const bool same = rows.KeyAt(cursor) == change.key && change.Shows(rows.At(cursor));
                         ++cursor;
                         return same;
                       });
  }

  bool UpdateChildren(const QModelIndex& parent, Node& node, const Change& change)
  {
    return Synchronise(
        parent, node.children, change.children, [this](auto& item, int row, const ChildChange& child)
        { TellChanged(createIndex(row, 0, static_cast<const Item*>(&item)), UpdateChild(item, row, child)); },
        [this, &change](ChildRows& rows, typename ChildRows::Cursor before, const ChildChange& child)
        { return InsertChild(rows, before, change.key, child); }, [](auto&, int, const ChildChange&) {});
  }

  /// Inserts what is beneath a new subject as one block.
  void FillChildren(const QModelIndex& parent, Node& node, const Change& change)
  {
    if (change.children.empty())
      return;
    beginInsertRows(parent, 0, static_cast<int>(change.children.size()) - 1);
    for (const ChildChange& child : change.children)
      InsertChild(node.children, node.children.End(), change.key, child);
    endInsertRows();
  }

  const NMX::ESubjectKind m_filter;
  Nodes m_nodes;
};

}
