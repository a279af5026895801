#pragma once

#include "StoreUI/VStoreParameterModel.h"

#include <vector>

namespace SubjectStoreUI
{

/// The settings with which subjects are made and calibrated, in the order in which the panel shows them.
[[nodiscard]] std::vector<StoreUI::Parameter> SetupParameters();

/// What can be edited of a subject, whatever its kind.
[[nodiscard]] std::vector<StoreUI::Parameter> SubjectParameters();

}
