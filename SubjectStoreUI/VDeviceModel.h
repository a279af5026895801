#pragma once

#include "HostInterface/IDeviceServices.h"
#include "SubjectStoreUI/StoreWatch.h"

#include <QAbstractListModel>

#include <memory>
#include <string>
#include <vector>

namespace SubjectStoreUI
{

struct PanelBackend;

/// The devices of the host and the smart objects that they are linked to, in ascending order of their URNs. It follows
/// both. [gui]
class VDeviceModel final : public QAbstractListModel
{
  Q_OBJECT

public:
  /// By which QML knows them with a small first letter; the selection item is a VSelectionItemGadget.
  enum ERole : int
  {
    Urn = Qt::UserRole + 1,
    Type,
    Connected,
    Charging,
    Battery,  ///< percent
    LinkedTo, ///< the name of the object; empty for none
    SelectionItemRole
  };

  /// `watch` outlives this.
  VDeviceModel(const PanelBackend& backend, StoreWatch& watch);

  /// Whether the host had the device when the model last looked.
  [[nodiscard]] bool Has(const std::string& urn) const;

  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;
  [[nodiscard]] QHash<int, QByteArray> roleNames() const override;

private:
  struct Row
  {
    Device device;
    std::string linkedTo;

    friend bool operator==(const Row&, const Row&) = default;
  };

  [[nodiscard]] std::vector<Row> Read() const;
  void Refresh();

  const PanelBackend& m_backend;
  const std::shared_ptr<IDeviceServices> m_devices;
  std::vector<Row> m_rows;
};

}
