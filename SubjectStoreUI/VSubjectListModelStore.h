#pragma once

#include "SubjectStoreUI/RankedRows.h"
#include "SubjectStoreUI/VSubjectModelStoreBase.h"

namespace SubjectStoreUI
{

/// All subjects in one list, in ascending order of their ids. [gui]
class VSubjectListModelStore : public VSubjectModelStoreBase
{
  Q_OBJECT

public:
  /// What stands behind a row: the index points at it.
  class VSubjectInfo
  {
  public:
    VSubjectInfo(const VSubjectListModelStore& model, NMX::TSubjectStoreId subject)
        : m_model(&model), m_subject(subject)
    {
    }
    virtual ~VSubjectInfo() = default;

    [[nodiscard]] const VSubjectListModelStore& Model() const { return *m_model; }
    [[nodiscard]] NMX::TSubjectStoreId Subject() const { return m_subject; }

  private:
    const VSubjectListModelStore* m_model;
    NMX::TSubjectStoreId m_subject;
  };

  explicit VSubjectListModelStore(std::shared_ptr<ISubjectModelInternalData> data,
                                  VSubjectWarningSummary* summary = nullptr);

  [[nodiscard]] QModelIndex index(int row, int column, const QModelIndex& parent = {}) const override;
  [[nodiscard]] QModelIndex parent(const QModelIndex& index) const override;
  using QObject::parent;
  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;
  bool setData(const QModelIndex& index, const QVariant& value, int role) override;

  [[nodiscard]] int subjectRowCount(const QModelIndex& parent) const override;
  [[nodiscard]] QModelIndex indexForSubject(NMX::TSubjectStoreId subject) const override;
  void refresh() override;

private:
  struct Change
  {
    NMX::TSubjectStoreId key;
    ChangedAspects aspects;
  };

  [[nodiscard]] const VSubjectInfo* InfoOf(const QModelIndex& index) const;
  [[nodiscard]] std::vector<Change> Gather(SeenStamps& seen) const;

  RankedRows<VSubjectInfo> m_rows;
};

}
