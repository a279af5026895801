#pragma once

#include "HostInterface/NMX/VShared.h"
#include "SubjectStoreUI/ISubjectModelInternalData.h"
#include "SubjectStoreUI/SubjectChange.h"
#include "SubjectStoreUI/VSubjectWarningSummary.h"

#include <QAbstractItemModel>
#include <QPointer>
#include <QTimer>

#include <map>
#include <memory>
#include <vector>

namespace SubjectStoreUI
{

class VSubjectElementModel;

/// What the models of subjects have in common: roles and how they are read and edited, the batching of changes, and the
/// scheme by which a refresh turns what has changed in the store into row signals: gather, synchronise, remember,
/// summarise. A refresh reads first and sends signals afterwards, so that whoever hears one may read and edit. [gui]
class VSubjectModelStoreBase : public QAbstractItemModel, public NMX::VShared
{
  Q_OBJECT

public:
  ~VSubjectModelStoreBase() override;

  [[nodiscard]] int columnCount(const QModelIndex& parent) const override;
  [[nodiscard]] Qt::ItemFlags flags(const QModelIndex& index) const override;
  [[nodiscard]] QHash<int, QByteArray> roleNames() const override;

  /// The models of what subjects are made of, in the order in which they were attached.
  [[nodiscard]] virtual std::vector<std::shared_ptr<VSubjectElementModel>> elementModels() const;
  /// The row of a subject; the invalid index when it has none.
  [[nodiscard]] virtual QModelIndex indexForSubject(NMX::TSubjectStoreId subject) const = 0;
  /// Brings the rows up to date with the store.
  virtual void refresh() = 0;

  /// Shows the elements of the model's subjects beneath them, after those of the models attached before.
  void attachElementModel(std::shared_ptr<VSubjectElementModel> elements);

  /// How many rows of its own the model has beneath `parent`, without those of element models.
  [[nodiscard]] virtual int subjectRowCount(const QModelIndex& parent) const = 0;

  /// Refreshes from now on after changes of the store, at most once in an interval; with an interval of 0 at each. To
  /// be called once.
  void followStore(int intervalInMilliseconds);

  /// A change of the store: refreshes now, or makes sure that it will be done.
  void onStoreChanged();

protected:
  explicit VSubjectModelStoreBase(std::shared_ptr<ISubjectModelInternalData> data,
                                  VSubjectWarningSummary* summary = nullptr);

  [[nodiscard]] ISubjectModelInternalData* Data() const { return m_data.get(); }

  /// Whether a row is one of the top level; subjects can be at both.
  enum class ELevel
  {
    Top,
    Second
  };

  /// The value of a role of a subject that is shown in a row.
  [[nodiscard]] QVariant ReadRole(NMX::TSubjectStoreId subject, int role, ELevel level) const;

  /// Writes one of the two roles that can be edited. False when it is another, or the store refuses.
  bool WriteRole(NMX::TSubjectStoreId subject, const QVariant& value, int role);

  /// Makes the rows beneath `parent` those of `now`, in its order: what is gone is removed, what is new inserted, each
  /// row with signals of its own; for a row that stays `update(row, index, change)` is called, for a new one
  /// `insert(rows, cursor, change)`, which inserts it, and then `fill(row, index, change)`. Answers whether rows came
  /// or went.
  template <class Rows, class Changes, class Update, class Insert, class Fill>
  bool Synchronise(const QModelIndex& parent, Rows& rows, const Changes& now, Update update, Insert insert, Fill fill);

  /// Empties the model: `clear` drops its rows.
  template <class Clear>
  void Reset(Clear clear);

  /// Brings the element models up to date, after the rows.
  void RefreshElements();

  /// Tells of changed roles of a row.
  void TellChanged(const QModelIndex& index, const QList<int>& roles);

  /// Remembers what was seen, and brings the warning summary up to date if it may be another: `count(access, topLevel,
  /// children)` counts the warnings by type.
  template <class Count>
  void Remember(const SeenStamps& seen, bool rowsChanged, Count count);

  [[nodiscard]] const SeenStamps& Seen() const { return m_seen; }

  /// Counts the warnings of a subject.
  void CountWarnings(const NMX::IStoreReader& access, NMX::TSubjectStoreId subject, std::map<int, int>& counts) const;

private:
  const std::shared_ptr<ISubjectModelInternalData> m_data;
  const QPointer<VSubjectWarningSummary> m_summary;
  std::vector<std::shared_ptr<VSubjectElementModel>> m_elementModels;
  SeenStamps m_seen;
  std::uint64_t m_summarised = 0; // the warning stamp that the summary was made at
  QTimer m_timer;
  std::shared_ptr<const void> m_changes;
};

template <class Rows, class Changes, class Update, class Insert, class Fill>
bool VSubjectModelStoreBase::Synchronise(const QModelIndex& parent, Rows& rows, const Changes& now, Update update,
                                         Insert insert, Fill fill)
{
  bool changed = false;
  int row = 0;
  typename Rows::template Matcher<Changes> matcher(now);
  for (auto cursor = rows.Begin(); cursor != rows.End();)
  {
    if (matcher.Stays(rows.KeyAt(cursor)))
    {
      ++cursor;
      ++row;
      continue;
    }
    beginRemoveRows(parent, row, row);
    cursor = rows.Erase(cursor);
    endRemoveRows();
    changed = true;
  }
  row = 0;
  auto cursor = rows.Begin();
  for (const auto& change : now)
  {
    if (cursor != rows.End() && rows.KeyAt(cursor) == change.key)
      update(rows.At(cursor), row, change);
    else
    {
      beginInsertRows(parent, row, row);
      cursor = insert(rows, cursor, change);
      endInsertRows();
      fill(rows.At(cursor), row, change);
      changed = true;
    }
    ++cursor;
    ++row;
  }
  return changed;
}

template <class Clear>
void VSubjectModelStoreBase::Reset(Clear clear)
{
  beginResetModel();
  m_seen = {};
  clear();
  m_elementModels.clear();
  endResetModel();
}

template <class Count>
void VSubjectModelStoreBase::Remember(const SeenStamps& seen, bool rowsChanged, Count count)
{
  m_seen = seen;
  const std::uint64_t warnings = seen.Of(NMX::EAspect::Warnings);
  if (warnings <= m_summarised && !rowsChanged)
    return;
  m_summarised = warnings;
  if (!m_summary)
    return;
  std::map<int, int> topLevel;
  std::map<int, int> children;
  {
    const auto access = m_data->OpenRead();
    count(*access, topLevel, children);
  }
  m_summary->update(topLevel, children);
}

}
