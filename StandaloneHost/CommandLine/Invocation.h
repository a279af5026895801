#pragma once

#include "StandaloneHost/CommandLine/Target.h"

#include <map>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace CommandLine
{

/// An option of a command.
struct Option
{
  std::string_view name;
  std::string_view value; ///< what it takes, as the help calls it; empty: nothing
  std::string_view text;
};

/// A command line that was taken apart.
struct Invocation
{
  std::map<std::string, std::string, std::less<>> options; ///< those that are given, with their values
  std::vector<std::string> words;

  [[nodiscard]] bool Has(std::string_view option) const { return options.contains(option); }

  /// The option's value; empty when it is not given.
  [[nodiscard]] std::string Value(std::string_view option) const;

  /// The host to talk to, from options and environment. Throws CommandError.
  [[nodiscard]] Target Host() const;
};

/// A command: what its help says, and the function that carries it out and answers the exit status.
struct Command
{
  std::string_view name;
  std::string_view arguments; ///< as the help shows them
  std::string_view summary;
  std::string_view help; ///< more, in lines
  std::vector<Option> options;
  bool talks; ///< to a host, and has the options for that
  int (*run)(const Invocation&);
};

/// All options of a command, those for the host included.
[[nodiscard]] std::vector<Option> OptionsOf(const Command& command);

/// Throws CommandError.
[[nodiscard]] Invocation ParseWords(const Command& command, std::span<const std::string> words);

[[nodiscard]] std::string HelpText(const Command& command);

/// All commands that people are told of, and the one that completion scripts ask.
[[nodiscard]] const std::vector<Command>& Commands();

/// Null when there is none of that name.
[[nodiscard]] const Command* FindCommand(std::string_view name);

// Each has a source file of its own.
[[nodiscard]] int RunCall(const Invocation& invocation);
[[nodiscard]] int RunSubscribe(const Invocation& invocation);
[[nodiscard]] int RunDescribe(const Invocation& invocation);
[[nodiscard]] int RunCompletion(const Invocation& invocation);
[[nodiscard]] int RunComplete(const Invocation& invocation);

}
