#pragma once

#include "StandaloneHost/Store/Draft.h"

namespace Store
{

/// Brings the warnings of objects up to date that follow from their groups, devices and patterns, as an edit leaves
/// them. Costs what the edit touched: the objects that it changed, and those that share a group, a device or a pattern
/// with them before or after.
///
/// - A device that two objects are linked to, one that is not known, not connected or being charged, and a cluster
/// without
///   a device concern an object whether it is enabled or not.
/// - Only enabled objects need patterns, conflict with each other's, and count in groups.
/// - An object is unique in its proximity group when it is in no template group. What is wrong with a group is said of
/// each
///   of its members. Objects of a template group are identical when they have the same markers and types of cluster.
void DeriveObjectWarnings(Draft& draft);

/// The same for all objects.
void DeriveAllObjectWarnings(Draft& draft);

}
