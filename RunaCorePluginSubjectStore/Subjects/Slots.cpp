#include "RunaCorePluginSubjectStore/Subjects/Slots.h"

#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"

#include <vector>

namespace Subjects
{

using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

IResult FindSlot(const NMX::IStoreReader& access, TSubjectStoreId character, std::uint32_t index, NMX::Slot& slot)
{
  std::vector<NMX::Slot> slots;
  if (const IResult read = NMX::Read(access, character, Paths::Slots(), slots); read.Failed())
    return read;
  if (index >= slots.size())
    return EResult::InvalidIndex;
  slot = slots[index];
  return slot.id.Valid() ? EResult::Ok : EResult::InvalidId;
}

IResult FindSlotObject(const NMX::IStoreReader& access, TSubjectStoreId character, TSubjectStoreId slot,
                       TSubjectStoreId& object)
{
  std::vector<TSubjectStoreId> children;
  if (const IResult listed = access.Children(character, children); listed.Failed())
    return listed;
  for (const TSubjectStoreId child : children)
  {
    TSubjectStoreId filled;
    if (const IResult read = NMX::Read(access, child, Paths::ParentSubjectSlotId(), filled); read.Failed())
      return read;
    if (filled == slot)
    {
      object = child;
      return EResult::Ok;
    }
  }
  object = {};
  return EResult::Ok;
}

IResult FillSlot(NMX::IEntryEditor& editor, TSubjectStoreId character, TSubjectStoreId slot, TSubjectStoreId object)
{
  TSubjectStoreId occupant;
  if (const IResult found = FindSlotObject(editor, character, slot, occupant); found.Failed() || occupant == object)
    return found;
  if (occupant.Valid())
    if (const IResult released = editor.SetValue(occupant, Paths::ParentSubjectId(), TSubjectStoreId{});
        released.Failed())
      return released;
  if (!object.Valid())
    return EResult::Ok;
  if (const IResult moved = editor.SetValue(object, Paths::ParentSubjectId(), character); moved.Failed())
    return moved;
  return editor.SetValue(object, Paths::ParentSubjectSlotId(), slot);
}

}
