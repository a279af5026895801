#pragma once

#include "StandaloneHost/Store/Draft.h"

namespace Store
{

/// Brings up to date, before a commit, what subjects have because of other subjects: the warnings of objects that
/// follow from groups, devices and patterns; a character is warned while an object in one of its slots has warnings.
/// Costs what the edit touched.
void DeriveDependents(Draft& draft);

}
