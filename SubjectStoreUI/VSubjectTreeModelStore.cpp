#include "SubjectStoreUI/VSubjectTreeModelStore.h"

#include <utility>

namespace SubjectStoreUI
{

VSubjectTreeModelStore::VSubjectTreeModelStore(std::shared_ptr<ISubjectModelInternalData> data,
                                               NMX::ESubjectKind filter, VSubjectWarningSummary* summary)
    : SubjectTree(std::move(data), filter, summary)
{
  VSubjectTreeModelStore::refresh();
}

QVariant VSubjectTreeModelStore::data(const QModelIndex& index, int role) const
{
  const IItem* item = ItemOf(index);
  return item != nullptr ? ReadRole(item->Subject(), role, item->TopLevel() ? ELevel::Top : ELevel::Second)
                         : QVariant{};
}

std::vector<Tree::ChildChange> VSubjectTreeModelStore::GatherChildren(const NMX::IStoreReader& access,
                                                                      NMX::TSubjectStoreId subject,
                                                                      SeenStamps& seen) const
{
  std::vector<Tree::ChildChange> children;
  for (const NMX::TSubjectStoreId child : Data()->Children(access, subject))
  {
    NMX::ChangeStamps stamps{};
    if (!child.Valid() || access.Stamps(child, stamps).Failed())
      continue;
    children.push_back({child, ChangedAspects(stamps, Seen())});
    seen.Fold(stamps);
  }
  return children;
}

RankedRows<Tree::IItem>::Cursor VSubjectTreeModelStore::InsertChild(RankedRows<IItem>& rows,
                                                                    RankedRows<IItem>::Cursor before,
                                                                    NMX::TSubjectStoreId parent,
                                                                    const Tree::ChildChange& change)
{
  return rows.Insert(before, change.key, parent);
}

QList<int> VSubjectTreeModelStore::UpdateChild(IItem& /*item*/, int /*row*/, const Tree::ChildChange& change)
{
  return TreeRoles(change.aspects);
}

}
