#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StoreInterface/IEntryEditor.h"

#include <span>
#include <vector>

/// Putting objects into slots of characters by hand. Each operation has its rule as a function of its own, so that what
/// is offered is what is accepted.
namespace Subjects
{

/// A slot of a character that has nothing in it.
struct EmptySlot
{
  NMX::TSubjectStoreId character;
  std::uint32_t index = 0; ///< in the character's order
  NMX::Slot slot;
};

/// Whether the object can be put into that slot: `InvalidType` when it is no object, `NotSupported` for a slot of
/// anything but a character, `InvalidIndex`, `AlreadySet` when something is in the slot, `InvalidValue` for an object
/// that the character is beneath.
NMX::IResult CheckAssign(const NMX::IStoreReader& access, NMX::TSubjectStoreId object, NMX::TSubjectStoreId character,
                         std::uint32_t slotIndex);
NMX::IResult Assign(NMX::IEntryEditor& editor, NMX::TSubjectStoreId object, NMX::TSubjectStoreId character,
                    std::uint32_t slotIndex);

/// Whether all of these, one or more, are in slots: `InvalidArgument` otherwise.
NMX::IResult CheckUnassign(const NMX::IStoreReader& access, std::span<const NMX::TSubjectStoreId> objects);

/// Takes them out of their slots.
NMX::IResult Unassign(NMX::IEntryEditor& editor, std::span<const NMX::TSubjectStoreId> objects);

/// The same, and they are no longer assigned automatically.
NMX::IResult Detach(NMX::IEntryEditor& editor, std::span<const NMX::TSubjectStoreId> objects);

/// All objects that are in no slot and beneath nothing, in ascending order of id.
[[nodiscard]] std::vector<NMX::TSubjectStoreId> UnassignedObjects(const NMX::IStoreReader& access);

/// All empty slots, in ascending order of the characters' ids and then in the characters' order.
[[nodiscard]] std::vector<EmptySlot> EmptySlots(const NMX::IStoreReader& access);

}
