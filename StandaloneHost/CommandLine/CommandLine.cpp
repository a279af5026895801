#include "StandaloneHost/CommandLine/CommandLine.h"

#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Invocation.h"
#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/CommandLine/Output.h"

#include <csignal>
#include <exception>

namespace CommandLine
{

namespace
{

constexpr std::string_view callHelp =
    R"(Calls a function of a running host and prints what it answers.

Arguments stand in the function's order, or as NAME=VALUE (describe METHOD shows them):
  text                  as it stands; "NAME=" goes before a text that could be taken for NAME=VALUE
  number, true, false   as they stand
  enumeration           the value's name or number
  set or list of texts  a JSON array, or texts with commas between them
A word that begins with -- goes after a single --.

METHOD may be without its group and in any case, as long as only one is meant.

Exit status: 0 success, 1 the call failed, 2 wrong command line, 3 the host cannot be reached or refuses.
With --wait: 1 when the work did not end well, and 128 and the signal's number when Ctrl-C ended the waiting.
)";

constexpr std::string_view subscribeHelp =
    R"(Prints changes as a running host tells of them, one a line, until Ctrl-C: the time, the callback's name, its
arguments. NAME is a callback, or GROUP.* for all of a group. A connection that is lost is made anew, which is told on
standard error, as is a restart of the host.
)";

constexpr std::string_view describeHelp =
    R"(Shows what a running host offers: without a name all groups, otherwise a group, function, callback or enumeration.
)";

constexpr std::string_view completionHelp =
    R"(Prints a script with which the shell completes commands, options, and what the running host offers:
  bash   source <(subject-store-host completion bash)
  zsh    source <(subject-store-host completion zsh)
  fish   subject-store-host completion fish | source
)";

constexpr std::string_view completeHelp =
    R"(Prints what the last of the words could become, one a line. For completion scripts.
)";

int Run(const Command& command, std::span<const std::string> words)
{
  const Invocation invocation = ParseWords(command, words);
  if (invocation.Has("help"))
  {
    Print(HelpText(command));
    return 0;
  }
  if (command.talks)
    if (const Target target = invocation.Host(); target.ShowsToken())
      Tell("everybody on the way to " + target.Url() + " can read the token; https:// hides it");
  return command.run(invocation);
}

CommandError UnknownCommand(std::string_view word)
{
  std::string names;
  for (const Command& command : Commands())
    if (!command.summary.empty())
      names += (names.empty() ? "" : ", ") + std::string(command.name);
  return UsageError(Quoted(word) + " is neither an option nor a command (" + names + "); --help tells more");
}

}

const std::vector<Command>& Commands()
{
  static const std::vector<Command> commands{
      {"call",
       "METHOD [ARGUMENT…]",
       "call a function of a running host",
       callHelp,
       {{"wait", "", "follow work that goes on after the answer until it ends"},
        {"wait-time", "SECONDS", "give up waiting after that time; the work goes on (default: never)"}},
       true,
       RunCall},
      {"subscribe",
       "NAME…",
       "print changes as a running host tells of them",
       subscribeHelp,
       {{"once", "", "end after one notification"}, {"count", "N", "end after N notifications"}},
       true,
       RunSubscribe},
      {"describe", "[NAME]", "show what a running host offers", describeHelp, {}, true, RunDescribe},
      {"completion",
       "bash|zsh|fish",
       "print a script for the shell's completion",
       completionHelp,
       {},
       false,
       RunCompletion},
      {"complete",
       "[--] WORD…",
       "",
       completeHelp,
       {{"line", "LINE", "an unfinished command line instead of words"}},
       false,
       RunComplete}};
  return commands;
}

bool IsCommandLine(int argumentCount, const char* const* arguments)
{
  return argumentCount > 1 && arguments[1][0] != '-';
}

int RunCommandLine(int argumentCount, const char* const* arguments)
{
  try
  {
    std::signal(SIGPIPE, SIG_IGN);
    const std::vector<std::string> words(arguments + 1, arguments + argumentCount);
    const Command* command = FindCommand(words.front());
    if (command == nullptr)
      throw UnknownCommand(words.front());
    return Run(*command, std::span(words).subspan(1));
  }
  catch (const Ended&)
  {
    return static_cast<int>(EStatus::Success);
  }
  catch (const CommandError& failure)
  {
    Tell(failure.what());
    return static_cast<int>(failure.Status());
  }
  catch (const std::exception& failure)
  {
    Tell(failure.what());
    return static_cast<int>(EStatus::Unreachable);
  }
}

}
