#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StoreInterface/Value.h"

#include <string>
#include <string_view>

namespace NMX
{

/// The colour as "#aarrggbb", alpha first, in lower case.
[[nodiscard]] std::string ColourToText(const Colour& colour);

/// Reads "#AARRGGBB", or "#RRGGBB" with alpha 255, in either case. `InvalidArgument` for anything else; `colour` is
/// untouched then.
IResult ColourFromText(std::string_view text, Colour& colour);

}
