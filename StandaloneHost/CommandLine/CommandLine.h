#pragma once

namespace CommandLine
{

/// Whether the host's command line begins with the word of a command, or what could be meant as one.
[[nodiscard]] bool IsCommandLine(int argumentCount, const char* const* arguments);

/// Carries out a command, which talks to a host that runs, and answers the exit status. Takes the whole command line.
/// Throws nothing; what goes wrong is told in a line on standard error.
[[nodiscard]] int RunCommandLine(int argumentCount, const char* const* arguments);

}
