#pragma once

#include "HostInterface/NMX/IResult.h"

#include <string>
#include <string_view>

namespace Subjects
{

/// The check that every new name passes before the store is asked: `InvalidName` when it begins or ends with a space.
/// All other rules, that of the empty name included, are the store's.
NMX::IResult CheckNewName(std::string_view name);

/// Whether a name matches a pattern (ECMAScript) in full. Nothing matches a pattern that is not well-formed, or takes
/// too long: the log says why. [any]
[[nodiscard]] bool MatchesPattern(std::string_view name, const std::string& pattern);

}
