#pragma once

#include "StandaloneHost/Store/Draft.h"

namespace Store
{

/// Whether a subject calibration runs; an application entry that is there only while one does.
[[nodiscard]] NMX::EntryPath CalibrationRunning();

/// Keeps the settings true that say what can be made and calibrated, and why not (the actions of the subject panel), as
/// an edit leaves the settings and names that they depend on. A setting that does not exist is not made.
void DeriveCreateActions(Draft& draft);

/// The same whatever the draft has changed.
void DeriveAllCreateActions(Draft& draft);

}
