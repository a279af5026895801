#pragma once

#include "StandaloneHost/CommandLine/Description.h"

#include <string>
#include <string_view>

namespace CommandLine
{

/// What a function answered, as lines for people: a list alone one a line, warnings as a table, several outputs by
/// name. `function`: null for one that the description does not have. `width`: 0 wraps nothing. Throws HostError.
[[nodiscard]] std::string ResultText(const Function* function, const std::string& json, const Description& description,
                                     std::size_t width);

/// Why a call failed, in a line: the code's name, what it means, what more there is to say. Throws HostError.
[[nodiscard]] std::string ErrorText(const std::string& json);

/// A notification's arguments in a line: NAME=VALUE, without the sequence. Throws HostError.
[[nodiscard]] std::string NotificationText(const Notification& notification, const Description& description);

}
