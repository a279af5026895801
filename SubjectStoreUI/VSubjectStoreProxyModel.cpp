#include "SubjectStoreUI/VSubjectStoreProxyModel.h"

#include "SubjectStoreUI/SubjectGadgets.h"
#include "SubjectStoreUI/SubjectsModelRole.h"
#include "SubjectStoreUI/VSubjectElementModel.h"
#include "SubjectStoreUI/VSubjectModelStoreBase.h"

#include <algorithm>
#include <utility>

namespace SubjectStoreUI
{

using NMX::TSubjectStoreId;

namespace
{

constexpr NMX::LogChannel channel{"SubjectStoreUI.SubjectStoreProxyModel"};

TSubjectStoreId SubjectAt(const QModelIndex& baseIndex)
{
  return baseIndex.data(SubjectsModelRole::SubjectStoreId).value<VStoreIdGadget>().Id();
}

}

VSubjectStoreProxyModel::VSubjectStoreProxyModel(std::shared_ptr<VSubjectModelStoreBase> base) : m_base(std::move(base))
{
  if (!m_base)
    NMX::Log(channel, NMX::ESeverity::Error, "Invalid parent QAbstractItemModel.");
  FollowSources();
}

VSubjectStoreProxyModel::~VSubjectStoreProxyModel()
{
  LeaveSources(); // the base model may be destroyed with this, and its element models with it
}

QModelIndex VSubjectStoreProxyModel::index(int row, int column, const QModelIndex& parent) const
{
  if (!m_base || row < 0 || column != 0)
    return {};
  if (!parent.isValid())
    return row < m_base->subjectRowCount({}) ? createIndex(row, 0, &m_topLevel) : QModelIndex{};
  const Link* link = LinkOf(parent);
  if (link == nullptr ||
      SourceOf(*link, "Failed to create index: parent index's internal data is invalid.") == nullptr ||
      !IsTopLevel(*link))
    return {};
  const QModelIndex baseParent = ToSource(parent, *link);
  if (!baseParent.isValid())
    return {};
  int before = 0;
  for (std::size_t source = 0; source < m_sources.size(); ++source)
  {
    before += RowsOf(source, baseParent);
    if (row < before)
      return createIndex(row, 0, LinkTo(source, SubjectAt(baseParent)));
  }
  return {};
}

QModelIndex VSubjectStoreProxyModel::parent(const QModelIndex& index) const
{
  const Link* link = LinkOf(index);
  if (link == nullptr || SourceOf(*link, "Failed to get parent index: index's internal data is invalid.") == nullptr ||
      IsTopLevel(*link))
    return {};
  const QModelIndex baseParent = m_base->indexForSubject(link->parent);
  return baseParent.isValid() ? createIndex(baseParent.row(), 0, &m_topLevel) : QModelIndex{};
}

int VSubjectStoreProxyModel::rowCount(const QModelIndex& parent) const
{
  if (!parent.isValid())
    return m_base ? m_base->subjectRowCount({}) : 0;
  const Link* link = LinkOf(parent);
  if (link == nullptr ||
      SourceOf(*link, "Failed to get row count: parent index's internal data is invalid.") == nullptr ||
      !IsTopLevel(*link))
    return 0;
  const QModelIndex baseParent = ToSource(parent, *link);
  return baseParent.isValid() ? RowsBefore(m_sources.size(), baseParent) : 0;
}

int VSubjectStoreProxyModel::columnCount(const QModelIndex& parent) const
{
  if (!parent.isValid())
    return m_base ? m_base->columnCount({}) : 0;
  const Link* link = LinkOf(parent);
  const QAbstractItemModel* source =
      link != nullptr ? SourceOf(*link, "Failed to get column count: parent index's internal data is invalid.")
                      : nullptr;
  return source != nullptr ? source->columnCount(ToSource(parent, *link)) : 0;
}

QVariant VSubjectStoreProxyModel::data(const QModelIndex& index, int role) const
{
  const Link* link = LinkOf(index);
  const QAbstractItemModel* source =
      link != nullptr ? SourceOf(*link, "Failed to get data: index's internal data is invalid.") : nullptr;
  return source != nullptr ? source->data(ToSource(index, *link), role) : QVariant{};
}

bool VSubjectStoreProxyModel::setData(const QModelIndex& index, const QVariant& value, int role)
{
  const Link* link = LinkOf(index);
  QAbstractItemModel* source =
      link != nullptr ? SourceOf(*link, "Failed to set data: index's internal data is invalid.") : nullptr;
  return source != nullptr && source->setData(ToSource(index, *link), value, role);
}

Qt::ItemFlags VSubjectStoreProxyModel::flags(const QModelIndex& index) const
{
  const Link* link = LinkOf(index);
  const QAbstractItemModel* source =
      link != nullptr ? SourceOf(*link, "Failed to get flags: index's internal data is invalid.") : nullptr;
  return source != nullptr ? source->flags(ToSource(index, *link)) : Qt::NoItemFlags;
}

QHash<int, QByteArray> VSubjectStoreProxyModel::roleNames() const
{
  return m_base ? m_base->roleNames() : QHash<int, QByteArray>{};
}

const VSubjectStoreProxyModel::Link* VSubjectStoreProxyModel::LinkOf(const QModelIndex& index) const
{
  return index.isValid() && index.model() == this ? static_cast<const Link*>(index.internalPointer()) : nullptr;
}

const VSubjectStoreProxyModel::Link* VSubjectStoreProxyModel::LinkTo(std::size_t source, TSubjectStoreId parent) const
{
  if (!parent.Valid())
    return &m_topLevel;
  std::vector<Link>& links = m_links[parent];
  if (links.empty())
    for (std::size_t each = 0; each < m_sources.size(); ++each)
      links.push_back({each, parent});
  return &links[source];
}

QAbstractItemModel* VSubjectStoreProxyModel::SourceOf(const Link& link, const NMX::LogFormat& failure) const
{
  QAbstractItemModel* source = m_sources[link.source];
  if (source == nullptr)
    NMX::Log(channel, NMX::ESeverity::Error, failure);
  return source;
}

QModelIndex VSubjectStoreProxyModel::ToSource(const QModelIndex& index, const Link& link) const
{
  if (IsTopLevel(link))
    return m_base->index(index.row(), 0);
  const QModelIndex baseParent = m_base->indexForSubject(link.parent);
  if (!baseParent.isValid())
    return {};
  return m_sources[link.source]->index(index.row() - RowsBefore(link.source, baseParent), 0, baseParent);
}

int VSubjectStoreProxyModel::RowsOf(std::size_t source, const QModelIndex& baseParent) const
{
  if (source == 0)
    return m_base->subjectRowCount(baseParent);
  return m_sources[source] ? m_sources[source]->rowCount(baseParent) : 0;
}

int VSubjectStoreProxyModel::RowsBefore(std::size_t source, const QModelIndex& baseParent) const
{
  int rows = 0;
  for (std::size_t before = 0; before < source; ++before)
    rows += RowsOf(before, baseParent);
  return rows;
}

std::optional<VSubjectStoreProxyModel::Place> VSubjectStoreProxyModel::PlaceOf(std::size_t source,
                                                                               const QModelIndex& baseParent) const
{
  if (!baseParent.isValid() && source == 0)
    return Place{{}, &m_topLevel, 0};
  // A subject can be a child without a row of the top level; its elements have no place then.
  if (!baseParent.isValid() || baseParent.model() != m_base.get() || baseParent.parent().isValid())
    return std::nullopt;
  return Place{createIndex(baseParent.row(), 0, &m_topLevel), LinkTo(source, SubjectAt(baseParent)),
               RowsBefore(source, baseParent)};
}

std::optional<VSubjectStoreProxyModel::Place>
VSubjectStoreProxyModel::PlaceOfSender(const QModelIndex& baseParent) const
{
  const auto source = std::find(m_sources.begin(), m_sources.end(), sender());
  return source != m_sources.end() ? PlaceOf(static_cast<std::size_t>(source - m_sources.begin()), baseParent)
                                   : std::nullopt;
}

void VSubjectStoreProxyModel::FollowSources()
{
  LeaveSources();
  m_links.clear();
  m_sources.clear();
  if (!m_base)
    return;
  m_sources.emplace_back(m_base.get());
  for (const auto& elements : m_base->elementModels())
    m_sources.emplace_back(elements.get());
  using M = QAbstractItemModel;
  using P = VSubjectStoreProxyModel;
  for (QAbstractItemModel* source : m_sources)
  {
    connect(source, &M::dataChanged, this, &P::OnDataChanged);
    connect(source, &M::rowsAboutToBeInserted, this, &P::OnRowsAboutToBeInserted);
    connect(source, &M::rowsInserted, this, &P::OnRowsInserted);
    connect(source, &M::rowsAboutToBeRemoved, this, &P::OnRowsAboutToBeRemoved);
    connect(source, &M::rowsRemoved, this, &P::OnRowsRemoved);
    connect(source, &M::rowsAboutToBeMoved, this, &P::OnRowsAboutToBeMoved);
    connect(source, &M::rowsMoved, this, &P::OnRowsMoved);
    connect(source, &M::modelAboutToBeReset, this, &P::OnModelAboutToBeReset);
    connect(source, &M::modelReset, this, &P::OnModelReset);
    connect(source, &QObject::destroyed, this, &P::OnSourceGone);
  }
}

void VSubjectStoreProxyModel::LeaveSources()
{
  for (const auto& source : m_sources)
    if (source)
      disconnect(source, nullptr, this, nullptr);
}

void VSubjectStoreProxyModel::OnSourceGone()
{
  // Its rows have gone already, without a signal. The links stay: who still asks about such a row is to be told.
  if (m_resets > 0)
    return;
  beginResetModel();
  endResetModel();
}

void VSubjectStoreProxyModel::OnDataChanged(const QModelIndex& i_rTopLeft, const QModelIndex& i_rBottomRight,
                                            const QList<int>& i_rRoles)
{
  if (!i_rTopLeft.isValid())
    return;
  if (const auto place = PlaceOfSender(i_rTopLeft.parent()))
    Q_EMIT dataChanged(createIndex(i_rTopLeft.row() + place->offset, 0, place->link),
                       createIndex(i_rBottomRight.row() + place->offset, 0, place->link), i_rRoles);
}

void VSubjectStoreProxyModel::OnRowsAboutToBeInserted(const QModelIndex& i_rParent, int i_First, int i_Last)
{
  const auto place = PlaceOfSender(i_rParent);
  m_begun.push_back(place ? &VSubjectStoreProxyModel::endInsertRows : End{});
  if (place)
    beginInsertRows(place->parent, i_First + place->offset, i_Last + place->offset);
}

void VSubjectStoreProxyModel::OnRowsInserted(const QModelIndex& /*i_rParent*/, int /*i_First*/, int /*i_Last*/)
{
  EndChange();
}

void VSubjectStoreProxyModel::OnRowsAboutToBeRemoved(const QModelIndex& i_rParent, int i_First, int i_Last)
{
  const auto place = PlaceOfSender(i_rParent);
  m_begun.push_back(place ? &VSubjectStoreProxyModel::endRemoveRows : End{});
  if (!place)
    return;
  if (IsTopLevel(*place->link))
    for (int row = i_First; row <= i_Last; ++row)
      m_leaving.push_back(SubjectAt(m_base->index(row, 0)));
  beginRemoveRows(place->parent, i_First + place->offset, i_Last + place->offset);
}

void VSubjectStoreProxyModel::OnRowsRemoved(const QModelIndex& /*i_rParent*/, int /*i_First*/, int /*i_Last*/)
{
  EndChange();
  for (const TSubjectStoreId subject : std::exchange(m_leaving, {}))
    m_links.erase(subject);
}

void VSubjectStoreProxyModel::OnRowsAboutToBeMoved(const QModelIndex& i_rSourceParent, int i_SourceStart,
                                                   int i_SourceEnd, const QModelIndex& i_rDestinationParent,
                                                   int i_DestinationRow)
{
  const auto from = PlaceOfSender(i_rSourceParent);
  const auto to = PlaceOfSender(i_rDestinationParent);
  End end = nullptr;
  if (from && to)
  {
    if (beginMoveRows(from->parent, i_SourceStart + from->offset, i_SourceEnd + from->offset, to->parent,
                      i_DestinationRow + to->offset))
      end = &VSubjectStoreProxyModel::endMoveRows;
  }
  else if (from)
  {
    beginRemoveRows(from->parent, i_SourceStart + from->offset, i_SourceEnd + from->offset);
    end = &VSubjectStoreProxyModel::endRemoveRows;
  }
  else if (to)
  {
    const int last = i_DestinationRow + i_SourceEnd - i_SourceStart;
    beginInsertRows(to->parent, i_DestinationRow + to->offset, last + to->offset);
    end = &VSubjectStoreProxyModel::endInsertRows;
  }
  m_begun.push_back(end);
}

void VSubjectStoreProxyModel::OnRowsMoved(const QModelIndex& /*i_rSourceParent*/, int /*i_SourceStart*/,
                                          int /*i_SourceEnd*/, const QModelIndex& /*i_rDestinationParent*/,
                                          int /*i_DestinationRow*/)
{
  EndChange();
}

void VSubjectStoreProxyModel::OnModelAboutToBeReset()
{
  if (m_resets++ == 0)
    beginResetModel();
}

void VSubjectStoreProxyModel::OnModelReset()
{
  if (--m_resets > 0)
    return;
  FollowSources();
  endResetModel();
}

void VSubjectStoreProxyModel::EndChange()
{
  if (m_begun.empty())
    return;
  const End end = m_begun.back();
  m_begun.pop_back();
  if (end != nullptr)
    (this->*end)();
}

}
