#include "SubjectStoreUI/VSubjectElementModel.h"

#include "StoreInterface/EntryPaths.h"
#include "SubjectStoreUI/SubjectChange.h"
#include "SubjectStoreUI/SubjectGadgets.h"
#include "SubjectStoreUI/VSubjectModelStoreBase.h"

#include <QThread>

#include <algorithm>
#include <map>
#include <utility>
#include <vector>

namespace SubjectStoreUI
{

namespace Paths = NMX::Paths;
namespace Role = SubjectsModelRole;
using NMX::TSubjectStoreId;

namespace
{

/// One row.
struct Element
{
  QString name;
  QVariant place;   ///< of a marker
  QVariant device;  ///< of a cluster
  QVariant pattern; ///< of a cluster

  friend bool operator==(const Element&, const Element&) = default;
};

template <class T>
const T* Find(const NMX::IStoreReader& access, TSubjectStoreId subject, NMX::EntryPath path)
{
  const NMX::Value* value = nullptr;
  return access.Find(subject, path, value).Succeeded() && value != nullptr ? std::get_if<T>(value) : nullptr;
}

/// Markers have no names in the store: they are numbered.
std::vector<Element> ReadElements(const NMX::IStoreReader& access, TSubjectStoreId subject)
{
  std::vector<Element> elements;
  if (const auto* clusters = Find<std::vector<NMX::SmartCluster>>(access, subject, Paths::SmartClusters()))
    for (const NMX::SmartCluster& cluster : *clusters)
      elements.push_back({QString::fromStdString(cluster.label),
                          {},
                          QStringList{QString::fromStdString(cluster.deviceUrn)},
                          QVariantList{cluster.pattern}});
  if (const auto* markers = Find<std::vector<NMX::Position>>(access, subject, Paths::Markers()))
    for (const NMX::Position& marker : *markers)
    {
      VPositionGadget place;
      place.x = marker.x;
      place.y = marker.y;
      place.z = marker.z;
      elements.push_back(
          {QStringLiteral("Marker %1").arg(elements.size() + 1), QVariantList{QVariant::fromValue(place)}, {}, {}});
    }
  return elements;
}

}

struct VSubjectElementModel::Elements
{
  struct OfSubject
  {
    std::vector<Element> rows;
    NMX::ChangeStamps stamps{};
  };

  std::map<TSubjectStoreId, OfSubject> known; ///< those that somebody has asked for
};

VSubjectElementModel::VSubjectElementModel(std::shared_ptr<ISubjectModelInternalData> data,
                                           VSubjectModelStoreBase& subjects)
    : m_data(std::move(data)), m_subjects(&subjects), m_elements(std::make_unique<Elements>())
{
}

VSubjectElementModel::~VSubjectElementModel() = default;

QModelIndex VSubjectElementModel::index(int row, int column, const QModelIndex& parent) const
{
  if (row < 0 || column != 0 || row >= rowCount(parent))
    return {};
  const auto subject = parent.data(Role::SubjectStoreId).value<VStoreIdGadget>().Id();
  return createIndex(row, column, static_cast<quintptr>(subject.Value()));
}

QModelIndex VSubjectElementModel::parent(const QModelIndex& index) const
{
  return index.isValid() && m_subjects ? m_subjects->indexForSubject(TSubjectStoreId(index.internalId()))
                                       : QModelIndex{};
}

int VSubjectElementModel::rowCount(const QModelIndex& parent) const
{
  if (!parent.isValid() || parent.model() != m_subjects)
    return 0;
  const auto subject = parent.data(Role::SubjectStoreId).value<VStoreIdGadget>().Id();
  if (!subject.Valid())
    return 0;
  const auto [known, unknown] = m_elements->known.try_emplace(subject);
  if (unknown)
  {
    const auto access = m_data->OpenRead();
    (void)access->Stamps(subject, known->second.stamps);
    known->second.rows = ReadElements(*access, subject);
  }
  return static_cast<int>(known->second.rows.size());
}

int VSubjectElementModel::columnCount(const QModelIndex& /*parent*/) const
{
  return 1;
}

QVariant VSubjectElementModel::data(const QModelIndex& index, int role) const
{
  if (!index.isValid() || index.model() != this)
    return {};
  const auto known = m_elements->known.find(TSubjectStoreId(index.internalId()));
  if (known == m_elements->known.end() || index.row() >= static_cast<int>(known->second.rows.size()))
    return {};
  const Element& element = known->second.rows[static_cast<std::size_t>(index.row())];
  switch (role)
  {
  case Role::SubjectName:
    return element.name;
  case Role::SubjectProxySortName:
    return QString::number(index.row());
  case Role::SubjectIsSubjectElement:
  case Role::SubjectHasParent:
    return true;
  case Role::SubjectIsSlot:
    return false;
  case Role::SubjectSmartAndBasicMarkers:
    return element.place;
  case Role::SubjectSmartClusterDeviceNames:
    return element.device;
  case Role::SubjectPatterns:
    return element.pattern;
  default:
    return {};
  }
}

Qt::ItemFlags VSubjectElementModel::flags(const QModelIndex& index) const
{
  return index.isValid() ? Qt::ItemIsSelectable | Qt::ItemIsEnabled : Qt::NoItemFlags;
}

QHash<int, QByteArray> VSubjectElementModel::roleNames() const
{
  return Role::Names();
}

void VSubjectElementModel::refresh()
{
  Q_ASSERT(thread() == QThread::currentThread());
  // All is read before the first signal is sent, so that whoever hears one may read and edit.
  std::map<TSubjectStoreId, Elements::OfSubject> changed;
  std::vector<TSubjectStoreId> gone;
  {
    const auto access = m_data->OpenRead();
    for (const auto& [subject, elements] : m_elements->known)
    {
      NMX::ChangeStamps stamps{};
      if (!m_subjects || !m_subjects->indexForSubject(subject).isValid())
        gone.push_back(subject); // its row has gone with all that was beneath
      else if (access->Stamps(subject, stamps).Succeeded() && stamps != elements.stamps) // else its row goes soon
        changed.emplace(subject, Elements::OfSubject{ReadElements(*access, subject), stamps});
    }
  }
  for (const TSubjectStoreId subject : gone)
    m_elements->known.erase(subject);
  for (auto& [subject, now] : changed)
  {
    auto& known = m_elements->known.at(subject);
    known.stamps = now.stamps;
    const QModelIndex parent = m_subjects->indexForSubject(subject);
    const auto id = static_cast<quintptr>(subject.Value());
    const int before = static_cast<int>(known.rows.size());
    const int after = static_cast<int>(now.rows.size());
    if (after < before)
    {
      beginRemoveRows(parent, after, before - 1);
      known.rows.resize(now.rows.size());
      endRemoveRows();
    }
    for (int row = 0; row < std::min(before, after); ++row)
    {
      const auto place = static_cast<std::size_t>(row);
      if (known.rows[place] == now.rows[place])
        continue;
      known.rows[place] = now.rows[place];
      Q_EMIT dataChanged(createIndex(row, 0, id), createIndex(row, 0, id));
    }
    if (after > before)
    {
      beginInsertRows(parent, before, after - 1);
      known.rows = std::move(now.rows);
      endInsertRows();
    }
  }
}

}
