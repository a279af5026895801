#pragma once

#include "HostInterface/NMX/VShared.h"
#include "SubjectStoreUI/ISubjectModelInternalData.h"

#include <QAbstractItemModel>
#include <QPointer>

#include <memory>

namespace SubjectStoreUI
{

class VSubjectModelStoreBase;

/// What subjects are made of, read-only: the markers of a basic object, the clusters of a smart object. Its rows lie
/// beneath rows of a model of subjects, to which it is attached: that model's indexes are the parents of its own.
///
/// Roles of a row: the name; whether it is an element (true); for a marker its place; for a cluster its device and its
/// pattern, each as a list of one as subjects have them. [gui]
class VSubjectElementModel : public QAbstractItemModel, public NMX::VShared
{
  Q_OBJECT

public:
  /// Elements of the subjects of `subjects`, which attaches this model.
  VSubjectElementModel(std::shared_ptr<ISubjectModelInternalData> data, VSubjectModelStoreBase& subjects);
  ~VSubjectElementModel() override;

  [[nodiscard]] QModelIndex index(int row, int column, const QModelIndex& parent) const override;
  [[nodiscard]] QModelIndex parent(const QModelIndex& index) const override;
  using QObject::parent;
  [[nodiscard]] int rowCount(const QModelIndex& parent) const override;
  [[nodiscard]] int columnCount(const QModelIndex& parent) const override;
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;
  [[nodiscard]] Qt::ItemFlags flags(const QModelIndex& index) const override;
  [[nodiscard]] QHash<int, QByteArray> roleNames() const override;

  /// Brings the rows that somebody has asked for up to date with the store; their subjects' rows are up to date.
  void refresh();

private:
  struct Elements;

  const std::shared_ptr<ISubjectModelInternalData> m_data;
  const QPointer<VSubjectModelStoreBase> m_subjects;
  std::unique_ptr<Elements> m_elements;
};

}
