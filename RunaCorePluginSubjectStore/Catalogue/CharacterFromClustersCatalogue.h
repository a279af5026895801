#pragma once

#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/ICharacterFromClustersServices.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/GroupTable.h"

namespace Catalogue
{

/// Everything that the remote group "CharacterFromClustersServices" publishes.
[[nodiscard]] const TerminalServer2::GroupTable<NMX::ICharacterFromClustersServices>& CharacterFromClustersGroup();

}
