#pragma once

#include <string_view>

namespace CommandLine
{

/// Writes to standard output and sees that it has gone out. Throws Ended when nobody reads it any more, CommandError
/// when it cannot be written for another reason.
void Print(std::string_view text);

/// Writes a line to standard error, "subject-store-host: " before it. What it says is for people; the text is visible.
void Tell(std::string_view text);

}
