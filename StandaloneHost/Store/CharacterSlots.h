#pragma once

#include "StandaloneHost/Store/Draft.h"

namespace Store
{

/// Whether an object may be assigned to a slot: auto-assign is enabled for it, and it is nobody's child.
[[nodiscard]] bool IsAutoAssignable(const SubjectRecord& record);

/// Whether a character's empty slots are to be filled: it is enabled and has some.
[[nodiscard]] bool AwaitsObjects(const SubjectRecord& record);

/// Brings characters up to date as an edit leaves them. Costs what the edit touched.
///
/// - A slot holds one object. A subject that claims one that is taken, by a child with a lower id, or does not exist is
///   in no slot.
/// - With `autoAssign`, the empty slots of enabled characters are filled by auto-assignable objects: characters in the
///   order in which they were added, their slots in order, by the objects in the order in which they were added. What
///   is in a slot stays there. A character is not given an object that it is beneath.
/// - An object in a slot, with auto-assign enabled, has the slot's name as its auto-assigned name; others have none.
/// - The warnings of characters follow: of empty slots and of warnings on the objects in them, of a missing
///   calibration, and with `autoAssign` of a missing reference cluster and missing objects.
void DeriveCharacters(Draft& draft, bool autoAssign);

/// The same for all characters and objects.
void DeriveAllCharacters(Draft& draft, bool autoAssign);

}
