#pragma once

#include "RunaCorePluginSubjectStore/SmartObjectServices/ISmartObjectServices.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/GroupTable.h"

namespace Catalogue
{

/// Everything that the remote group "SmartObjectServices" publishes.
[[nodiscard]] const TerminalServer2::GroupTable<NMX::ISmartObjectServices>& SmartObjectGroup();

}
