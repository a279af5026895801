#pragma once

#include "HostInterface/NMX/IResult.h"

#include <string>

namespace StoreUI
{

/// What a result says to people, as a sentence; empty for a success.
[[nodiscard]] std::string ResultSentence(NMX::IResult result);

/// The same of an assignment of active marker patterns, which has reasons of its own.
[[nodiscard]] std::string PatternSentence(NMX::IResult result);

}
