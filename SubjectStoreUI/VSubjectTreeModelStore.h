#pragma once

#include "SubjectStoreUI/SubjectTree.h"

namespace SubjectStoreUI
{

namespace Tree
{

/// What stands behind a row of either level.
class IItem
{
public:
  explicit IItem(NMX::TSubjectStoreId subject, NMX::TSubjectStoreId parent = {}) : m_subject(subject), m_parent(parent)
  {
  }

  [[nodiscard]] NMX::TSubjectStoreId Subject() const { return m_subject; }
  /// The subject that it is beneath.
  [[nodiscard]] NMX::TSubjectStoreId Parent() const { return m_parent; }
  [[nodiscard]] bool TopLevel() const { return !m_parent.Valid(); }

private:
  NMX::TSubjectStoreId m_subject;
  NMX::TSubjectStoreId m_parent;
};

/// What a refresh has learnt of a child.
struct ChildChange
{
  NMX::TSubjectStoreId key;
  ChangedAspects aspects;

  [[nodiscard]] static bool Shows(const IItem& /*item*/) { return true; }
};

}

/// The subjects of one kind, and beneath each its children, in ascending order of their ids. [gui]
class VSubjectTreeModelStore : public SubjectTree<Tree::IItem, RankedRows<Tree::IItem>, Tree::ChildChange>
{
  Q_OBJECT

public:
  using IItem = Tree::IItem;

  VSubjectTreeModelStore(std::shared_ptr<ISubjectModelInternalData> data, NMX::ESubjectKind filter,
                         VSubjectWarningSummary* summary = nullptr);

  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;

protected:
  [[nodiscard]] std::vector<Tree::ChildChange>
  GatherChildren(const NMX::IStoreReader& access, NMX::TSubjectStoreId subject, SeenStamps& seen) const override;
  RankedRows<IItem>::Cursor InsertChild(RankedRows<IItem>& rows, RankedRows<IItem>::Cursor before,
                                        NMX::TSubjectStoreId parent, const Tree::ChildChange& change) override;
  QList<int> UpdateChild(IItem& item, int row, const Tree::ChildChange& change) override;
};

}
