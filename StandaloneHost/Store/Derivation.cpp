#include "StandaloneHost/Store/Derivation.h"

#include "StandaloneHost/Store/CharacterSlots.h"
#include "StandaloneHost/Store/CreateActions.h"
#include "StandaloneHost/Store/ObjectWarnings.h"

namespace Store
{

void DeriveDependents(Draft& draft, const DerivationRules& rules)
{
  DeriveObjectWarnings(draft); // first: characters are warned of their objects' warnings
  DeriveCharacters(draft, rules.autoAssign);
  DeriveCreateActions(draft);
}

void DeriveAll(Draft& draft, const DerivationRules& rules)
{
  DeriveAllObjectWarnings(draft);
  DeriveAllCharacters(draft, rules.autoAssign);
  DeriveAllCreateActions(draft);
}

}
