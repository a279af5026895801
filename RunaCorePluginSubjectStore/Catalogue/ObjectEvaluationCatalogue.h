#pragma once

#include "RunaCorePluginSubjectStore/ObjectEvaluationServices/IObjectEvaluationServices.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/GroupTable.h"

namespace Catalogue
{

/// Everything that the remote group "ObjectEvaluationServices" publishes.
[[nodiscard]] const TerminalServer2::GroupTable<NMX::IObjectEvaluationServices>& ObjectEvaluationGroup();

}
