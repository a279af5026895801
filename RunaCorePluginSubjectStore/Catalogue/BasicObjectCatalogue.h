#pragma once

#include "RunaCorePluginSubjectStore/BasicObjectServices/IBasicObjectServices.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/GroupTable.h"

namespace Catalogue
{

/// Everything that the remote group "BasicObjectServices" publishes.
[[nodiscard]] const TerminalServer2::GroupTable<NMX::IBasicObjectServices>& BasicObjectGroup();

}
