#pragma once

#include "HostInterface/NMX/IResult.h"

#include <string>

namespace StoreUI
{

/// What a result says to people, as a sentence; empty for a success.
[[nodiscard]] std::string ResultSentence(NMX::IResult result);

}
