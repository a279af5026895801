#pragma once

#include "HostInterface/NMX/IPostalService.h"
#include "StoreInterface/IStore.h"

#include <QAbstractListModel>
#include <QTimer>

#include <memory>
#include <optional>
#include <vector>

namespace StoreUI
{

/// An entry of the store that a panel shows.
struct Parameter
{
  NMX::EntryPath path;
  QString key;   ///< by which views tell it from others
  QString label; ///< for people, with the unit if it has one
  bool editable = true;
};

/// What a model of parameters tells of a row.
namespace ParameterRole
{

enum ERole : int
{
  Key = Qt::UserRole + 1,
  Label,
  Type,    ///< "text", "number", "bool", "option", "colour" or "action"
  Value,   ///< a colour is "#aarrggbb", an option the name of its choice
  Choices, ///< the names of an option's choices
  Editable,
  Problem ///< why the last edit was refused, or why an action is impossible; empty otherwise
};

}

/// The values of entries, to be read and edited: those of one subject, or those of the application. Entries that the
/// subject lacks have no row. The model follows the store; edits are commits of their own. [gui]
class VStoreParameterModel : public QAbstractListModel
{
  Q_OBJECT

public:
  /// Of the application's entries.
  VStoreParameterModel(std::shared_ptr<NMX::IStore> store, std::weak_ptr<NMX::IPostalService> gui,
                       std::vector<Parameter> parameters, QObject* parent = nullptr);

  /// Shows the entries of a subject from now on; of nothing with the invalid id.
  void ShowSubject(NMX::TSubjectStoreId subject);

  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;
  [[nodiscard]] QHash<int, QByteArray> roleNames() const override;

  /// Writes the role Value. False when the store refuses: the role Problem says why.
  bool setData(const QModelIndex& index, const QVariant& value, int role = ParameterRole::Value) override;

private:
  struct Row
  {
    const Parameter* parameter = nullptr;
    NMX::Value value;
    QString problem;
  };

  [[nodiscard]] std::vector<Row> Read() const;
  [[nodiscard]] const NMX::Value* Find(const NMX::IStoreReader& access, const Parameter& parameter) const;
  [[nodiscard]] NMX::IResult Write(const Row& row, const QVariant& value, std::string& problem);
  void Refresh();

  const std::shared_ptr<NMX::IStore> m_store;
  const std::vector<Parameter> m_parameters;
  std::optional<NMX::TSubjectStoreId> m_subject; ///< none: the application
  std::vector<Row> m_rows;
  QTimer m_timer; ///< changes that come together cost one refresh
  std::vector<NMX::Subscription> m_subscriptions;
};

/// The value that a variant stands for, of the type that `current` has; none when it cannot be one.
[[nodiscard]] std::optional<NMX::Value> FromVariant(const QVariant& variant, const NMX::Value& current);

}
