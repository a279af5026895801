#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StoreInterface/IEntryEditor.h"

/// The slots of characters. An object is in a slot when its parent is the character and its parent slot that slot.
namespace Subjects
{

/// The slot of that index, in the character's order. `InvalidIndex` when it has fewer.
NMX::IResult FindSlot(const NMX::IStoreReader& access, NMX::TSubjectStoreId character, std::uint32_t index,
                      NMX::Slot& slot);

/// The object in a slot; the invalid id when the slot is empty.
NMX::IResult FindSlotObject(const NMX::IStoreReader& access, NMX::TSubjectStoreId character, NMX::TSubjectStoreId slot,
                            NMX::TSubjectStoreId& object);

/// Puts an object into a slot, out of the one that it was in, or, with the invalid id, empties the slot. What was in
/// the slot is nobody's child afterwards.
NMX::IResult FillSlot(NMX::IEntryEditor& editor, NMX::TSubjectStoreId character, NMX::TSubjectStoreId slot,
                      NMX::TSubjectStoreId object);

}
