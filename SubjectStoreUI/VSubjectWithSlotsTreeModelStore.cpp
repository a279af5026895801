#include "SubjectStoreUI/VSubjectWithSlotsTreeModelStore.h"

#include "SubjectStoreUI/SubjectGadgets.h"

#include <algorithm>
#include <utility>

namespace SubjectStoreUI
{

namespace Role = SubjectsModelRole;

QString ShortSlotName(const QString& name)
{
  if (name.size() < 2)
    return QStringLiteral("??");
  const auto isCapital = [](QChar character) { return character >= u'A' && character <= u'Z'; };
  const auto capital = std::find_if(name.begin() + 1, name.end(), isCapital);
  return QString(name[0].toUpper()) + (capital != name.end() ? *capital : name[1].toUpper());
}

VSubjectWithSlotsTreeModelStore::VSubjectWithSlotsTreeModelStore(std::shared_ptr<ISubjectModelInternalData> data,
                                                                 NMX::ESubjectKind filter,
                                                                 VSubjectWarningSummary* summary)
    : SubjectTree(std::move(data), filter, summary)
{
  VSubjectWithSlotsTreeModelStore::refresh();
}

QVariant VSubjectWithSlotsTreeModelStore::data(const QModelIndex& index, int role) const
{
  const IItem* item = ItemOf(index);
  if (item == nullptr)
    return {};
  if (item->TopLevel())
    return ReadRole(item->Subject(), role, ELevel::Top);
  if (role == Role::SubjectProxySortName)
    return QString::number(index.row());
  if (item->Subject().Valid())
    if (QVariant value = ReadRole(item->Subject(), role, ELevel::Second); value.isValid())
      return value;
  return SlotData(*item, index.row(), role);
}

/// What a slot answers by itself.
QVariant VSubjectWithSlotsTreeModelStore::SlotData(const IItem& item, int row, int role) const
{
  switch (role)
  {
  case Role::SubjectEnabled:
  case Role::SubjectIsAutoAssignable:
  case Role::SubjectIsSubjectElement:
    return false;
  case Role::SubjectIsSlot:
  case Role::SubjectHasParent:
    return true;
  case Role::SubjectSlotName:
    return item.Slot().name;
  case Role::SubjectSlotShortName:
    return ShortSlotName(item.Slot().name);
  case Role::SubjectSelectionItem:
    return QVariant::fromValue(VSelectionItemGadget(item.Parent(), row));
  default:
    return {};
  }
}

std::vector<SlotTree::ChildChange> VSubjectWithSlotsTreeModelStore::GatherChildren(const NMX::IStoreReader& access,
                                                                                   NMX::TSubjectStoreId subject,
                                                                                   SeenStamps& seen) const
{
  std::vector<SlotTree::ChildChange> slots;
  for (SlotContent& slot : Data()->Slots(access, subject))
  {
    ChangedAspects aspects;
    NMX::ChangeStamps stamps{};
    if (slot.subject.Valid() && access.Stamps(slot.subject, stamps).Succeeded())
    {
      aspects = ChangedAspects(stamps, Seen());
      seen.Fold(stamps);
    }
    slots.push_back({slot.slot, aspects, std::move(slot)});
  }
  return slots;
}

SequenceRows<SlotTree::IItem>::Cursor VSubjectWithSlotsTreeModelStore::InsertChild(SequenceRows<IItem>& rows,
                                                                                   SequenceRows<IItem>::Cursor before,
                                                                                   NMX::TSubjectStoreId parent,
                                                                                   const SlotTree::ChildChange& change)
{
  return rows.Insert(before, parent, change.slot, static_cast<int>(before));
}

QList<int> VSubjectWithSlotsTreeModelStore::UpdateChild(IItem& item, int row, const SlotTree::ChildChange& change)
{
  const bool moved = row != item.Row();
  const bool other = !change.Shows(item);
  item.Show(change.slot, row);
  if (other)
    return Role::All();
  QList<int> roles = TreeRoles(change.aspects);
  if (moved && !change.aspects.parameters)
    roles << Role::SubjectSelectionItem << Role::SubjectProxySortName;
  return roles;
}

}
