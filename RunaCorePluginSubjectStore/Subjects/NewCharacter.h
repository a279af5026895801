#pragma once

#include "HostInterface/ICharacterControls.h"
#include "StoreInterface/IStore.h"

#include <filesystem>
#include <string>

namespace Subjects
{

/// Makes a character from a template file: one edit, which is not open while the file is read. A name that cannot be
/// given is refused before the file is looked at. Results as of ICharacterControls. [any]
NMX::IResult CreateCharacter(NMX::IStore& store, ICharacterControls& controls, const std::string& name,
                             const std::filesystem::path& file, NMX::TSubjectStoreId& id);

}
