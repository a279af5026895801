#include "RunaCorePluginSubjectStore/Subjects/NewCharacter.h"

#include "StoreInterface/TryToAdd.h"

#include <memory>

namespace Subjects
{

using NMX::IResult;

IResult CreateCharacter(NMX::IStore& store, ICharacterControls& controls, const std::string& name,
                        const std::filesystem::path& file, NMX::TSubjectStoreId& id)
{
  if (const IResult possible = NMX::TryToAdd(store, NMX::ESubjectKind::CharactersFromClusters, name); possible.Failed())
    return possible;
  std::shared_ptr<const ICharacterTemplate> content;
  if (const IResult read = controls.ReadTemplate(file, content); read.Failed())
    return read;
  const auto editor = store.Editor();
  if (const IResult created = controls.CreateFromTemplate(*editor, name, *content); created.Failed())
    return created;
  if (const IResult found = editor->FindByName(name, id); found.Failed())
    return found;
  return editor->Commit();
}

}
