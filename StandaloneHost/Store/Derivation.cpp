#include "StandaloneHost/Store/Derivation.h"

#include "StandaloneHost/Store/ObjectWarnings.h"

#include <set>

namespace Store
{

namespace
{

using Id = NMX::TSubjectStoreId;

bool IsCharacter(const SubjectRecord* record)
{
  return record != nullptr && record->kind == NMX::ESubjectKind::CharactersFromClusters;
}

/// The characters that changed, or whose objects changed, came or went.
std::set<Id> TouchedCharacters(const Draft& draft)
{
  std::set<Id> characters;
  const auto touch = [&](const SubjectRecord* record)
  {
    if (record == nullptr)
      return;
    if (IsCharacter(draft.Find(record->id)))
      characters.insert(record->id);
    if (IsCharacter(draft.Find(record->Parent())))
      characters.insert(record->Parent());
  };
  for (const auto& [id, change] : draft.Changes().subjects)
  {
    touch(change.record.get());
    touch(draft.Base().Find(id));
  }
  return characters;
}

}

void DeriveDependents(Draft& draft)
{
  DeriveObjectWarnings(draft); // first: characters are warned of their objects' warnings
  const std::uint64_t childWarning = KindSchema::ChildWarningBit();
  for (const Id id : TouchedCharacters(draft))
  {
    const SubjectRecord& character = *draft.Find(id);
    bool warned = false;
    for (const Id child : character.Children())
      if (const SubjectRecord* object = draft.Find(child))
        warned = warned || (object->bits & KindSchema::WarningBits()) != 0;
    if (warned != ((character.bits & childWarning) != 0))
      draft.Change(id, NMX::EAspect::Warnings).bits ^= childWarning;
  }
}

}
