#pragma once

#include "StandaloneHost/Evaluation/Comparisons.h"
#include "StoreInterface/IStore.h"

#include <vector>

namespace Evaluation
{

/// Brings the objects' confusion warnings in line with the findings, in one edit, unless evaluation is off by now:
/// below the warning threshold an object could be confused, below half of it that is likely. `changed` tells whether
/// there was anything to do. A failure leaves all as it was.
NMX::IResult WriteWarnings(NMX::IStore& store, const std::vector<Comparisons::Finding>& findings, bool& changed);

/// Clears the confusion warnings of all objects.
NMX::IResult ClearWarnings(NMX::IEntryEditor& editor);

}
