#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace CommandLine
{

/// The one of these names that is meant: the whole name or what comes after its group, in this or, when that is
/// only one, in any case. Throws CommandError, which names those that it could be or that are near. `what`: such as
/// "function".
[[nodiscard]] std::string ResolveName(std::string_view given, const std::vector<std::string>& names,
                                      std::string_view what);

/// The name without its group.
[[nodiscard]] std::string_view WithoutGroup(std::string_view name);

/// In lower case, as far as it is ASCII.
[[nodiscard]] std::string LowerCase(std::string_view text);

}
