#pragma once

#include "HostInterface/NMX/IPostalService.h"
#include "HostInterface/NMX/VShared.h"
#include "StoreInterface/IStore.h"
#include "SubjectStoreUI/SubjectGadgets.h"

#include <QAbstractListModel>

#include <array>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace SubjectStoreUI
{

/// What the model of object presets tells of a row.
namespace ObjectPresetRole
{

enum ERole : int
{
  StoreId = Qt::UserRole + 1,
  Name,
  ReadOnly
};

struct Key
{
  ERole role;
  std::string_view text;
};

/// Every role with its key, in ascending order.
inline constexpr std::array keys{Key{StoreId, "StoreIdRole"}, Key{Name, "NameRole"}, Key{ReadOnly, "ReadOnlyRole"}};

static_assert(keys.front().role == 257 && keys.back().role == 259);

/// The name by which QML knows each.
[[nodiscard]] const QHash<int, QByteArray>& Names();

}

/// The named presets that objects can take their settings from, in ascending order of their numbers. The rows follow
/// the store: what is added or removed here shows once the store has told of it. [gui]
class VStoreObjectPresetModel : public QAbstractListModel, public NMX::VShared
{
  Q_OBJECT

public:
  /// Changes are told on `gui`, which runs its tasks on the GUI thread. `firstSelectedObject` answers the object that a
  /// new preset takes its parameters from, or the invalid id; it may be empty, and it may read the store.
  VStoreObjectPresetModel(std::shared_ptr<NMX::IStore> store, std::weak_ptr<NMX::IPostalService> gui,
                          std::function<NMX::TSubjectStoreId()> firstSelectedObject);

  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;
  [[nodiscard]] QHash<int, QByteArray> roleNames() const override;

  /// Adds a preset with the parameters of the first selected object, basic or smart; without one it has none. False,
  /// without effect, when the name is not valid or the store refuses.
  Q_INVOKABLE bool addPreset(const QString& name);

  /// False, without effect, when there is no such preset, it is read-only, or the store refuses.
  Q_INVOKABLE bool removePreset(const SubjectStoreUI::VStoreIdGadget& preset);

  /// Whether a new preset may have that name: it is not empty, and no preset has it. Case matters.
  Q_INVOKABLE [[nodiscard]] bool presetNameIsValid(const QString& name) const;

private:
  struct Preset
  {
    NMX::TSubjectStoreId id;
    std::string name;
    bool readOnly = false;
  };

  [[nodiscard]] std::vector<Preset> Read() const;
  void Refresh();

  const std::shared_ptr<NMX::IStore> m_store;
  const std::function<NMX::TSubjectStoreId()> m_firstSelectedObject;
  std::vector<Preset> m_presets;
  NMX::Subscription m_changes;
};

}
