#pragma once

#include "StandaloneHost/Store/Draft.h"

namespace Store
{

/// What the host wants to be derived.
struct DerivationRules
{
  bool autoAssign = true; ///< whether characters' empty slots are filled by themselves
};

/// Brings up to date, before a commit, what follows from other things: the warnings of objects, the slots of characters
/// with the warnings that follow from them, and which actions of the panel are possible. Costs what the edit touched.
void DeriveDependents(Draft& draft, const DerivationRules& rules);

/// The same for everything, whatever the draft has changed.
void DeriveAll(Draft& draft, const DerivationRules& rules);

}
