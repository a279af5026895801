#pragma once

#include "HostInterface/NMX/GlobalLog.h"
#include "HostInterface/NMX/ITypedId.h"
#include "HostInterface/NMX/VShared.h"

#include <QAbstractItemModel>
#include <QPointer>

#include <cstddef>
#include <memory>
#include <optional>
#include <unordered_map>
#include <vector>

namespace SubjectStoreUI
{

class VSubjectModelStoreBase;

/// Joins a model of subjects and the element models attached to it: a subject's elements are rows beneath it, after its
/// children, model by model. Only subjects of the top level have rows beneath them.
///
/// An index points at a link, which tells the model that the row is of and the subject that it is beneath. It stays at
/// its address for as long as that subject has a row. Sources are only ever given indexes of the base model. [gui]
class VSubjectStoreProxyModel : public QAbstractItemModel, public NMX::VShared
{
  Q_OBJECT

public:
  /// Without a base model, which is logged, there is nothing to show.
  explicit VSubjectStoreProxyModel(std::shared_ptr<VSubjectModelStoreBase> base);
  ~VSubjectStoreProxyModel() override;

  [[nodiscard]] QModelIndex index(int row, int column, const QModelIndex& parent = {}) const override;
  [[nodiscard]] QModelIndex parent(const QModelIndex& index) const override;
  using QObject::parent;
  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] int columnCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;
  bool setData(const QModelIndex& index, const QVariant& value, int role) override;
  [[nodiscard]] Qt::ItemFlags flags(const QModelIndex& index) const override;
  [[nodiscard]] QHash<int, QByteArray> roleNames() const override;

private Q_SLOTS:
  void OnDataChanged(const QModelIndex& i_rTopLeft, const QModelIndex& i_rBottomRight, const QList<int>& i_rRoles);
  void OnRowsAboutToBeInserted(const QModelIndex& i_rParent, int i_First, int i_Last);
  void OnRowsInserted(const QModelIndex& i_rParent, int i_First, int i_Last);
  void OnRowsAboutToBeRemoved(const QModelIndex& i_rParent, int i_First, int i_Last);
  void OnRowsRemoved(const QModelIndex& i_rParent, int i_First, int i_Last);
  void OnRowsAboutToBeMoved(const QModelIndex& i_rSourceParent, int i_SourceStart, int i_SourceEnd,
                            const QModelIndex& i_rDestinationParent, int i_DestinationRow);
  void OnRowsMoved(const QModelIndex& i_rSourceParent, int i_SourceStart, int i_SourceEnd,
                   const QModelIndex& i_rDestinationParent, int i_DestinationRow);
  void OnModelAboutToBeReset();
  void OnModelReset();

private:
  struct Link
  {
    std::size_t source;          ///< its position among the sources
    NMX::TSubjectStoreId parent; ///< the invalid id for a row of the top level
  };

  /// Where the rows are that a source has beneath one of the base model's indexes.
  struct Place
  {
    QModelIndex parent; ///< in this model
    const Link* link;
    int offset;
  };

  [[nodiscard]] bool IsTopLevel(const Link& link) const { return &link == &m_topLevel; }
  [[nodiscard]] const Link* LinkOf(const QModelIndex& index) const;
  [[nodiscard]] const Link* LinkTo(std::size_t source, NMX::TSubjectStoreId parent) const;

  /// The model that a row is of. Null, with `failure` logged, when it has gone.
  [[nodiscard]] QAbstractItemModel* SourceOf(const Link& link, const NMX::LogFormat& failure) const;
  [[nodiscard]] QModelIndex ToSource(const QModelIndex& index, const Link& link) const;

  [[nodiscard]] int RowsOf(std::size_t source, const QModelIndex& baseParent) const;
  [[nodiscard]] int RowsBefore(std::size_t source, const QModelIndex& baseParent) const;

  /// None when such rows are not shown.
  [[nodiscard]] std::optional<Place> PlaceOf(std::size_t source, const QModelIndex& baseParent) const;
  [[nodiscard]] std::optional<Place> PlaceOfSender(const QModelIndex& baseParent) const;

  void FollowSources();
  void LeaveSources();
  void OnSourceGone();

  /// Ends what the signal before a change has begun.
  void EndChange();

  const std::shared_ptr<VSubjectModelStoreBase> m_base;
  const Link m_topLevel{0, {}};
  std::vector<QPointer<QAbstractItemModel>> m_sources; ///< the base model, and then the element models
  /// By the subject that the rows are beneath, one for each source.
  mutable std::unordered_map<NMX::TSubjectStoreId, std::vector<Link>> m_links;
  std::vector<NMX::TSubjectStoreId> m_leaving; ///< those whose rows are being removed
  using End = void (QAbstractItemModel::*)();
  std::vector<End> m_begun; ///< null for a change of rows that are not shown
  int m_resets = 0;         ///< how many sources are within a reset
};

}
