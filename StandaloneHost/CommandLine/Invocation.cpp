#include "StandaloneHost/CommandLine/Invocation.h"

#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/Server/TokenFile.h"
#include "StandaloneHost/Server/VServer.h"

#include <boost/program_options.hpp>

#include <algorithm>
#include <cstdlib>
#include <unistd.h>

namespace CommandLine
{

namespace
{

namespace po = boost::program_options;

const std::vector<Option>& HostOptions()
{
  static const std::vector<Option> options{
      {"server", "URL", "the host (default: $SUBJECT_STORE_SERVER, or http://127.0.0.1:8420)"},
      {"token-file", "FILE", "send the token in this file (default: $SUBJECT_STORE_TOKEN_FILE)"},
      {"tls-ca", "FILE",
       "the authority, or the host's own certificate, to trust (default: $SUBJECT_STORE_TLS_CA, "
       "or those that the system trusts)"},
      {"timeout", "SECONDS", "how long to wait for a connection, and for an answer (default: 10)"},
      {"json", "", "print JSON, one value a line"}};
  return options;
}

std::string Environment(const char* name)
{
  const char* value = std::getenv(name);
  return value == nullptr ? std::string{} : value;
}

po::options_description Describe(const Command& command)
{
  po::options_description description;
  for (const Option& option : OptionsOf(command))
  {
    const std::string name(option.name);
    if (option.value.empty())
      description.add_options()(name.c_str(), "");
    else
      description.add_options()(name.c_str(), po::value<std::string>(), "");
  }
  return description;
}

std::string ReadToken(const std::string& file)
{
  try
  {
    return Server::ReadTokenFile(file);
  }
  catch (const Server::ServerError& failure)
  {
    throw UsageError(std::string("--token-file: ") + failure.what());
  }
}

}

std::string Invocation::Value(std::string_view option) const
{
  const auto found = options.find(option);
  return found == options.end() ? std::string{} : found->second;
}

Target Invocation::Host() const
{
  const auto given = [this](std::string_view option, const char* variable, const char* fallback)
  {
    if (Has(option))
      return Value(option);
    const std::string value = Environment(variable);
    return value.empty() ? std::string(fallback) : value;
  };
  Target target = ParseServer(given("server", "SUBJECT_STORE_SERVER", "http://127.0.0.1:8420"));
  const bool noToken = !Has("token-file") && Environment("SUBJECT_STORE_TOKEN_FILE").empty();
  if (!noToken)
    target.token = ReadToken(given("token-file", "SUBJECT_STORE_TOKEN_FILE", ""));
  target.authority = given("tls-ca", "SUBJECT_STORE_TLS_CA", "");
  if (Has("timeout"))
    target.timeout = ParseSeconds(Value("timeout"), "timeout");
  return target;
}

std::vector<Option> OptionsOf(const Command& command)
{
  std::vector<Option> options = command.options;
  if (command.talks)
    options.insert(options.end(), HostOptions().begin(), HostOptions().end());
  options.push_back({"help", "", "show this text and exit"});
  return options;
}

Invocation ParseWords(const Command& command, std::span<const std::string> words)
{
  const po::options_description description = Describe(command);
  Invocation invocation;
  try
  {
    // Without short options, so that a word such as -5 is an argument.
    const auto parsed = po::command_line_parser({words.begin(), words.end()})
                            .options(description)
                            .style(po::command_line_style::unix_style & ~po::command_line_style::allow_guessing &
                                   ~po::command_line_style::allow_short)
                            .run();
    for (const auto& part : parsed.options)
      if (part.position_key >= 0)
        invocation.words.insert(invocation.words.end(), part.value.begin(), part.value.end());
      else if (!invocation.options.emplace(part.string_key, part.value.empty() ? "" : part.value.front()).second)
        throw UsageError("--" + part.string_key + " is given twice");
  }
  catch (const po::error& failure)
  {
    throw UsageError(Visible(failure.what()) + "; " + std::string(command.name) + " --help lists the options");
  }
  return invocation;
}

std::string HelpText(const Command& command)
{
  const std::size_t width = TerminalWidth(STDOUT_FILENO);
  std::string text = "subject-store-host " + std::string(command.name) + " [options] " +
                     std::string(command.arguments) + "\n\n" + std::string(command.help) + "\nOptions:\n";
  std::vector<std::vector<std::string>> rows;
  for (const Option& option : OptionsOf(command))
    rows.push_back({"--" + std::string(option.name) + (option.value.empty() ? "" : " " + std::string(option.value)),
                    std::string(option.text)});
  return text + Table(rows, width, 2);
}

const Command* FindCommand(std::string_view name)
{
  const auto& commands = Commands();
  const auto found =
      std::find_if(commands.begin(), commands.end(), [name](const Command& command) { return command.name == name; });
  return found == commands.end() ? nullptr : &*found;
}

}
