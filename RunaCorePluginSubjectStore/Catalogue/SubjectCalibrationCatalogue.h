#pragma once

#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/ISubjectCalibrationServices.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/GroupTable.h"

namespace Catalogue
{

/// Everything that the remote group "SubjectCalibrationServices" publishes.
[[nodiscard]] const TerminalServer2::GroupTable<NMX::ISubjectCalibrationServices>& SubjectCalibrationGroup();

}
