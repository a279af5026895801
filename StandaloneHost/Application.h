#pragma once

#include "StandaloneHost/Options.h"

/// Runs the standalone host until SIGINT or SIGTERM, which the caller has blocked for all threads, or until the user
/// closes its window. What keeps it from starting is thrown, as an exception whose text is for people. [host]
void RunApplication(const Options& options);
