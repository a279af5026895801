#include "StandaloneHost/CommandLine/Client.h"
#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Description.h"
#include "StandaloneHost/CommandLine/Invocation.h"
#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/CommandLine/Names.h"
#include "StandaloneHost/CommandLine/Output.h"

#include <boost/program_options/parsers.hpp>

#include <algorithm>
#include <set>
#include <span>

namespace CommandLine
{

namespace
{

// The scripts know nothing but how to ask: what there is to complete is answered by the program itself.

constexpr std::string_view bashScript = R"(_subject_store_host() {
  case ${COMP_WORDS[COMP_CWORD-1]} in
  --token-file | --tls-ca) compopt -o default 2>/dev/null; COMPREPLY=(); return ;;
  esac
  if [[ $COMP_CWORD -gt 1 && ${COMP_WORDS[1]} == -* ]]; then
    compopt -o default 2>/dev/null; COMPREPLY=(); return
  fi
  mapfile -t COMPREPLY < <("${COMP_WORDS[0]}" complete --line "${COMP_LINE:0:COMP_POINT}" 2>/dev/null)
}
complete -F _subject_store_host subject-store-host
)";

constexpr std::string_view zshScript = R"(#compdef subject-store-host
_subject_store_host() {
  local -a candidates
  case $words[CURRENT-1] in
  --token-file | --tls-ca) _files; return ;;
  esac
  if (( CURRENT > 2 )) && [[ $words[2] == -* ]]; then
    _files; return
  fi
  candidates=("${(@f)$("${(Q)words[1]}" complete -- "${(@Q)words[2,CURRENT]}" 2>/dev/null)}")
  candidates=(${candidates:#})
  compadd -a candidates
}
compdef _subject_store_host subject-store-host
)";

constexpr std::string_view fishScript = R"(function __subject_store_host
  set -l words (commandline -opc)
  set -l program $words[1]
  set -e words[1]
  $program complete -- $words (commandline -ct) 2>/dev/null
end
complete -c subject-store-host -f -a '(__subject_store_host)'
for option in token-file tls-ca config plugin-file ready-file data
  complete -c subject-store-host -l $option -r -F
end
)";

/// A shell's user does not wait longer for a list of names.
constexpr auto patience = std::chrono::milliseconds(1000);

using Candidates = std::set<std::string>;

Candidates NamesOf(const std::vector<Function>& entries)
{
  Candidates names;
  for (const Function& entry : entries)
    names.insert(entry.name);
  return names;
}

/// Full names; when the word begins none of them, those that are meant without their group.
Candidates FunctionNames(const Description& description, std::string_view word)
{
  Candidates names = NamesOf(description.functions);
  if (std::any_of(names.begin(), names.end(), [word](const std::string& name) { return name.starts_with(word); }))
    return names;
  std::multiset<std::string> bare;
  for (const std::string& name : names)
    bare.emplace(WithoutGroup(name));
  names.clear();
  for (const std::string& name : bare)
    if (bare.count(name) == 1)
      names.insert(name);
  return names;
}

/// What an argument of a call can be: truth values, and the names of an enumeration.
Candidates ArgumentValues(const Description& description, const std::vector<std::string>& words)
{
  std::vector<std::string> functions;
  for (const Function& function : description.functions)
    functions.push_back(function.name);
  const Function* function = description.FindFunction(ResolveName(words.front(), functions, "function"));
  const std::size_t index = words.size() - 1;
  if (function == nullptr || index >= function->inputs.size())
    return {};
  const Argument& input = function->inputs[index];
  if (input.type == EType::Truth)
    return {"false", "true"};
  Candidates values;
  if (const Enumeration* enumeration = description.FindEnumeration(input.enumeration))
    for (const EnumerationValue& value : enumeration->values)
      values.insert(value.name);
  return values;
}

Candidates CallbackNames(const Description& description)
{
  Candidates names = NamesOf(description.callbacks);
  for (const Function& callback : description.callbacks)
    names.insert(callback.group + ".*");
  return names;
}

Candidates DescribedNames(const Description& description)
{
  Candidates names = NamesOf(description.functions);
  names.merge(NamesOf(description.callbacks));
  for (const Group& group : description.groups)
    names.insert(group.name);
  for (const Enumeration& enumeration : description.enumerations)
    names.insert(enumeration.name);
  return names;
}

/// What the word after those of the invocation can be, as the host that runs has it.
Candidates AskHost(const Command& command, const Invocation& invocation, std::string_view word)
{
  Target target = invocation.Host();
  target.timeout = std::min(target.timeout, patience);
  Loop loop;
  Client client(target, loop);
  const Description description = FetchDescription(client);
  if (command.name == "call")
    return invocation.words.empty() ? FunctionNames(description, word) : ArgumentValues(description, invocation.words);
  if (command.name == "subscribe")
    return CallbackNames(description);
  return invocation.words.empty() ? DescribedNames(description) : Candidates{};
}

/// What the last word can be. Throws CommandError when the words before it cannot be followed, or no host is there.
Candidates Complete(std::span<const std::string> words)
{
  const std::string& word = words.back();
  if (words.size() == 1)
  {
    Candidates names;
    for (const Command& command : Commands())
      if (!command.summary.empty())
        names.emplace(command.name);
    return names;
  }
  const Command* command = FindCommand(words.front());
  if (command == nullptr)
    return {};
  const auto before = words.subspan(1, words.size() - 2);
  // An option without its value is refused here, and nothing is offered for that.
  const Invocation invocation = ParseWords(*command, before);
  if (word.starts_with('-') && std::find(before.begin(), before.end(), "--") == before.end())
  {
    Candidates options;
    for (const Option& option : OptionsOf(*command))
      options.insert("--" + std::string(option.name));
    return options;
  }
  if (command->talks)
    return AskHost(*command, invocation, word);
  if (command->name == "completion" && invocation.words.empty())
    return {"bash", "fish", "zsh"};
  return {};
}

/// The words of an unfinished command line, without that of the program.
std::vector<std::string> SplitLine(const std::string& line)
{
  std::vector<std::string> words = boost::program_options::split_unix(line);
  if (line.empty() || line.back() == ' ')
    words.emplace_back();
  words.erase(words.begin());
  return words;
}

}

int RunCompletion(const Invocation& invocation)
{
  const std::string shell = invocation.words.size() == 1 ? invocation.words.front() : "";
  if (shell == "bash")
    Print(bashScript);
  else if (shell == "zsh")
    Print(zshScript);
  else if (shell == "fish")
    Print(fishScript);
  else
    throw UsageError("completion: for which shell: bash, zsh or fish?");
  return static_cast<int>(EStatus::Success);
}

int RunComplete(const Invocation& invocation)
{
  try
  {
    const std::vector<std::string> words =
        invocation.Has("line") ? SplitLine(invocation.Value("line")) : invocation.words;
    if (words.empty())
      return static_cast<int>(EStatus::Success);
    for (const std::string& candidate : Complete(words))
      if (candidate.starts_with(words.back()))
        Print(Visible(candidate) + '\n');
  }
  catch (const std::exception&)
  {
    // In the middle of a line that is being typed, there is nobody to tell.
    return static_cast<int>(EStatus::Success);
  }
  return static_cast<int>(EStatus::Success);
}

}
