#include "SubjectStoreUI/VSubjectListModelStore.h"

#include "SubjectStoreUI/VSubjectElementModel.h"

#include <QThread>

#include <utility>

namespace SubjectStoreUI
{

VSubjectListModelStore::VSubjectListModelStore(std::shared_ptr<ISubjectModelInternalData> data,
                                               VSubjectWarningSummary* summary)
    : VSubjectModelStoreBase(std::move(data), summary)
{
  VSubjectListModelStore::refresh();
}

const VSubjectListModelStore::VSubjectInfo* VSubjectListModelStore::InfoOf(const QModelIndex& index) const
{
  if (!index.isValid() || index.model() != this || index.row() >= m_rows.Count())
    return nullptr;
  return static_cast<const VSubjectInfo*>(index.internalPointer());
}

QModelIndex VSubjectListModelStore::index(int row, int column, const QModelIndex& parent) const
{
  if (row < 0 || column != 0)
    return {};
  if (!parent.isValid())
    return row < m_rows.Count() ? createIndex(row, column, &m_rows.At(row)) : QModelIndex{};
  if (parent.internalPointer() == nullptr)
    return {};
  for (const auto& elements : elementModels())
  {
    const int count = elements->rowCount(parent);
    if (row < count)
      return elements->index(row, column, parent);
    row -= count;
  }
  return {};
}

QModelIndex VSubjectListModelStore::parent(const QModelIndex& /*index*/) const
{
  return {};
}

int VSubjectListModelStore::rowCount(const QModelIndex& parent) const
{
  if (!parent.isValid())
    return m_rows.Count();
  int count = 0;
  if (parent.internalPointer() != nullptr)
    for (const auto& elements : elementModels())
      count += elements->rowCount(parent);
  return count;
}

int VSubjectListModelStore::subjectRowCount(const QModelIndex& parent) const
{
  return parent.isValid() ? 0 : m_rows.Count();
}

QVariant VSubjectListModelStore::data(const QModelIndex& index, int role) const
{
  const VSubjectInfo* info = InfoOf(index);
  return info != nullptr ? ReadRole(info->Subject(), role, ELevel::Top) : QVariant{};
}

bool VSubjectListModelStore::setData(const QModelIndex& index, const QVariant& value, int role)
{
  const VSubjectInfo* info = InfoOf(index);
  return info != nullptr && WriteRole(info->Subject(), value, role);
}

QModelIndex VSubjectListModelStore::indexForSubject(NMX::TSubjectStoreId subject) const
{
  const VSubjectInfo* info = m_rows.Find(subject);
  return info != nullptr ? createIndex(m_rows.PositionOf(subject), 0, info) : QModelIndex{};
}

std::vector<VSubjectListModelStore::Change> VSubjectListModelStore::Gather(SeenStamps& seen) const
{
  std::vector<Change> changes;
  const auto access = Data()->OpenRead();
  const auto subjects = Data()->Subjects(*access, {});
  changes.reserve(subjects.size());
  for (const NMX::TSubjectStoreId subject : subjects)
  {
    NMX::ChangeStamps stamps{};
    if (access->Stamps(subject, stamps).Failed())
      continue;
    changes.push_back({subject, ChangedAspects(stamps, Seen())});
    seen.Fold(stamps);
  }
  return changes;
}

void VSubjectListModelStore::refresh()
{
  Q_ASSERT(thread() == QThread::currentThread());
  SeenStamps seen = Seen();
  const std::vector<Change> now = Gather(seen);
  bool rowsChanged = true;
  if (now.empty() && !m_rows.Empty())
  {
    Reset([this] { m_rows.Clear(); });
    seen = {};
  }
  else
    rowsChanged = Synchronise(
        {}, m_rows, now,
        [this](VSubjectInfo& info, int row, const Change& change)
        {
          if (change.aspects.Any())
            TellChanged(createIndex(row, 0, &info), change.aspects.Roles());
        },
        [this](RankedRows<VSubjectInfo>& rows, RankedRows<VSubjectInfo>::Cursor before, const Change& change)
        { return rows.Insert(before, *this, change.key); }, [](VSubjectInfo&, int, const Change&) {});
  Remember(seen, rowsChanged,
           [this](const NMX::IStoreReader& access, std::map<int, int>& topLevel, std::map<int, int>&)
           {
             for (auto row = m_rows.Begin(); row != m_rows.End(); ++row)
               CountWarnings(access, row->Subject(), topLevel);
           });
  RefreshElements();
}

}
