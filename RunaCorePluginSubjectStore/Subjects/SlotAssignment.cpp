#include "RunaCorePluginSubjectStore/Subjects/SlotAssignment.h"

#include "RunaCorePluginSubjectStore/Subjects/Slots.h"
#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"
#include "StoreInterface/EntryPaths.h"

#include <algorithm>
#include <set>

namespace Subjects
{

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

bool InSlot(const NMX::IStoreReader& access, TSubjectStoreId object)
{
  const NMX::Value* parent = nullptr;
  const NMX::Value* slot = nullptr;
  const auto valid = [](const NMX::Value* value)
  {
    const auto* id = value != nullptr ? std::get_if<TSubjectStoreId>(value) : nullptr;
    return id != nullptr && id->Valid();
  };
  return access.Find(object, Paths::ParentSubjectId(), parent).Succeeded() && valid(parent) &&
         access.Find(object, Paths::ParentSubjectSlotId(), slot).Succeeded() && valid(slot);
}

}

IResult CheckAssign(const NMX::IStoreReader& access, TSubjectStoreId object, TSubjectStoreId character,
                    std::uint32_t slotIndex)
{
  if (const IResult checked = MustBeObject(access, object); checked.Failed())
    return checked == EResult::InvalidArgument ? IResult(EResult::InvalidType) : checked;
  if (const IResult checked = MustBeCharacter(access, character); checked.Failed())
    return checked;
  NMX::Slot slot;
  if (const IResult found = FindSlot(access, character, slotIndex, slot); found.Failed())
    return found;
  TSubjectStoreId occupant;
  if (const IResult found = FindSlotObject(access, character, slot.id, occupant); found.Failed())
    return found;
  if (occupant.Valid())
    return EResult::AlreadySet;
  std::vector<TSubjectStoreId> beneath;
  if (const IResult listed = access.Descendants(object, beneath); listed.Failed())
    return listed;
  return std::binary_search(beneath.begin(), beneath.end(), character) ? EResult::InvalidValue : EResult::Ok;
}

IResult Assign(NMX::IEntryEditor& editor, TSubjectStoreId object, TSubjectStoreId character, std::uint32_t slotIndex)
{
  if (const IResult checked = CheckAssign(editor, object, character, slotIndex); checked.Failed())
    return checked;
  NMX::Slot slot;
  if (const IResult found = FindSlot(editor, character, slotIndex, slot); found.Failed())
    return found;
  return FillSlot(editor, character, slot.id, object);
}

IResult CheckUnassign(const NMX::IStoreReader& access, std::span<const TSubjectStoreId> objects)
{
  const bool allIn =
      std::all_of(objects.begin(), objects.end(), [&](TSubjectStoreId object) { return InSlot(access, object); });
  return !objects.empty() && allIn ? EResult::Ok : EResult::InvalidArgument;
}

IResult Unassign(NMX::IEntryEditor& editor, std::span<const TSubjectStoreId> objects)
{
  if (const IResult checked = CheckUnassign(editor, objects); checked.Failed())
    return checked;
  for (const TSubjectStoreId object : objects)
    if (const IResult set = editor.SetValue(object, Paths::ParentSubjectId(), TSubjectStoreId{}); set.Failed())
      return set;
  return EResult::Ok;
}

IResult Detach(NMX::IEntryEditor& editor, std::span<const TSubjectStoreId> objects)
{
  if (const IResult unassigned = Unassign(editor, objects); unassigned.Failed())
    return unassigned;
  for (const TSubjectStoreId object : objects)
    if (const IResult set = editor.SetValue(object, Paths::AutoAssignEnabled(), false); set.Failed())
      return set;
  return EResult::Ok;
}

std::vector<TSubjectStoreId> UnassignedObjects(const NMX::IStoreReader& access)
{
  std::vector<TSubjectStoreId> objects;
  for (const ESubjectKind kind : {ESubjectKind::BasicObjects, ESubjectKind::SmartObjects})
  {
    std::vector<TSubjectStoreId> ofKind;
    (void)access.Subjects(kind, ofKind);
    for (const TSubjectStoreId id : ofKind)
    {
      const NMX::Value* parent = nullptr;
      (void)access.Find(id, Paths::ParentSubjectId(), parent);
      const auto* parentId = parent != nullptr ? std::get_if<TSubjectStoreId>(parent) : nullptr;
      if (parentId == nullptr || !parentId->Valid())
        objects.push_back(id);
    }
  }
  std::sort(objects.begin(), objects.end());
  return objects;
}

std::vector<EmptySlot> EmptySlots(const NMX::IStoreReader& access)
{
  std::vector<EmptySlot> empty;
  std::vector<TSubjectStoreId> characters;
  (void)access.Subjects(ESubjectKind::CharactersFromClusters, characters);
  for (const TSubjectStoreId character : characters)
  {
    std::vector<NMX::Slot> slots;
    std::vector<TSubjectStoreId> children;
    if (NMX::Read(access, character, Paths::Slots(), slots).Failed() || access.Children(character, children).Failed())
      continue;
    std::set<TSubjectStoreId> filled;
    for (const TSubjectStoreId child : children)
      if (TSubjectStoreId slot; NMX::Read(access, child, Paths::ParentSubjectSlotId(), slot).Succeeded())
        filled.insert(slot);
    for (std::uint32_t index = 0; index < slots.size(); ++index)
      if (slots[index].id.Valid() && !filled.contains(slots[index].id))
        empty.push_back({character, index, slots[index]});
  }
  return empty;
}

}
