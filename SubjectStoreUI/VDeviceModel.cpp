#include "SubjectStoreUI/VDeviceModel.h"

#include "StoreInterface/EntryPaths.h"
#include "SubjectStoreUI/PanelBackend.h"

#include <algorithm>
#include <map>

namespace SubjectStoreUI
{

VDeviceModel::VDeviceModel(const PanelBackend& backend, StoreWatch& watch)
    : m_backend(backend), m_devices(backend.Get(&RunaCorePluginInterface::IPanelServices::Devices))
{
  connect(&watch, &StoreWatch::changed, this, [this] { Refresh(); });
  m_rows = Read();
}

bool VDeviceModel::Has(const std::string& urn) const
{
  return std::ranges::binary_search(m_rows, urn, {},
                                    [](const Row& row) -> const std::string& { return row.device.urn; });
}

int VDeviceModel::rowCount(const QModelIndex& parent) const
{
  return parent.isValid() ? 0 : static_cast<int>(m_rows.size());
}

QVariant VDeviceModel::data(const QModelIndex& index, int role) const
{
  if (!checkIndex(index, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
    return {};
  const auto& [device, linkedTo] = m_rows[static_cast<std::size_t>(index.row())];
  switch (role)
  {
  case Qt::DisplayRole:
  case Urn:
    return QString::fromStdString(device.urn);
  case Type:
    return QString::fromStdString(device.type);
  case Connected:
    return device.connected;
  case Charging:
    return device.charging;
  case Battery:
    return device.battery;
  case LinkedTo:
    return QString::fromStdString(linkedTo);
  case SelectionItemRole:
    return QVariant::fromValue(VSelectionItemGadget(SelectionItem{{}, -1, device.urn}));
  default:
    return {};
  }
}

QHash<int, QByteArray> VDeviceModel::roleNames() const
{
  return {{Urn, "urn"},
          {Type, "type"},
          {Connected, "connected"},
          {Charging, "charging"},
          {Battery, "battery"},
          {LinkedTo, "linkedTo"},
          {SelectionItemRole, "selectionItem"}};
}

std::vector<VDeviceModel::Row> VDeviceModel::Read() const
{
  std::vector<Row> rows;
  if (!m_devices)
    return rows;
  std::map<std::string, std::string> links;
  {
    const auto access = m_backend.store->Reader();
    std::vector<NMX::TSubjectStoreId> objects;
    (void)access->Subjects(NMX::ESubjectKind::SmartObjects, objects);
    for (const NMX::TSubjectStoreId object : objects)
    {
      std::vector<NMX::SmartCluster> clusters;
      std::string name;
      if (NMX::Read(*access, object, NMX::Paths::SmartClusters(), clusters).Succeeded() &&
          NMX::Read(*access, object, NMX::Paths::Name(), name).Succeeded())
        for (const NMX::SmartCluster& cluster : clusters)
          links.emplace(cluster.deviceUrn, name);
    }
  }
  for (Device& device : m_devices->Devices())
  {
    const auto link = links.find(device.urn);
    std::string linkedTo = link != links.end() ? link->second : std::string{};
    rows.push_back({std::move(device), std::move(linkedTo)});
  }
  return rows;
}

void VDeviceModel::Refresh()
{
  std::vector<Row> now = Read();
  const auto urn = [](const Row& row) -> const std::string& { return row.device.urn; };
  // Both are in the order of the URNs.
  for (std::size_t row = 0; row < m_rows.size();)
  {
    if (std::ranges::binary_search(now, urn(m_rows[row]), {}, urn))
    {
      ++row;
      continue;
    }
    beginRemoveRows({}, static_cast<int>(row), static_cast<int>(row));
    m_rows.erase(m_rows.begin() + static_cast<std::ptrdiff_t>(row));
    endRemoveRows();
  }
  for (std::size_t row = 0; row < now.size(); ++row)
  {
    if (row == m_rows.size() || urn(m_rows[row]) != urn(now[row]))
    {
      beginInsertRows({}, static_cast<int>(row), static_cast<int>(row));
      m_rows.insert(m_rows.begin() + static_cast<std::ptrdiff_t>(row), now[row]);
      endInsertRows();
    }
    else if (m_rows[row] != now[row])
    {
      m_rows[row] = now[row];
      const QModelIndex index = createIndex(static_cast<int>(row), 0);
      Q_EMIT dataChanged(index, index);
    }
  }
}

}
