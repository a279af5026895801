#include "StandaloneHost/Server/Registry.h"

#include <algorithm>

namespace Server
{

using NMX::EResult;
using NMX::IResult;

namespace
{

/// The result code of a name as the documentation spells it.
bool FindCode(std::string_view name, IResult& code)
{
  // Two spellings of one code are in use.
  if (name == "SerializationFailure")
    name = "SerialisationFailure";
  const auto search = [&](EResult first)
  {
    for (auto number = static_cast<std::uint32_t>(first); !IResult(number).Name().empty(); ++number)
      if (IResult(number).Name() == name)
      {
        code = IResult(number);
        return true;
      }
    return false;
  };
  return search(EResult::Ok) || search(EResult::Failed);
}

template <class Entries, class Name>
bool Taken(const Entries& entries, std::string_view name, Name nameOf)
{
  return std::any_of(entries.begin(), entries.end(), [&](const auto& entry) { return nameOf(entry) == name; });
}

std::vector<std::string_view> NamesOf(const TerminalServer2::FunctionRecord& record,
                                      std::span<const TerminalServer2::ArgumentType> types,
                                      TerminalServer2::EDirection direction)
{
  std::vector<std::string_view> names;
  for (std::size_t i = 0; i < types.size() && i < record.arguments.size(); ++i)
    if (types[i].direction == direction)
      names.push_back(record.arguments[i].name);
  return names;
}

}

ResultTexts ReadResultTexts(std::string_view documentation)
{
  ResultTexts texts;
  while (!documentation.empty())
  {
    const std::string_view line = documentation.substr(0, documentation.find('\n'));
    documentation.remove_prefix(std::min(documentation.size(), line.size() + 1));
    const auto separator = line.find(" - ");
    IResult code;
    if (separator != std::string_view::npos && FindCode(line.substr(0, separator), code))
      texts.emplace_back(code, line.substr(separator + 3));
  }
  return texts;
}

std::string_view FunctionEntry::Meaning(IResult result) const
{
  for (const auto& [code, text] : results)
    if (code == result)
      return text;
  return {};
}

IResult Registry::Add(TerminalServer2::Level level, const TerminalServer2::TypeRecord& record)
{
  if (Taken(m_types, record.name, [](const TypeEntry& entry) { return entry.record.name; }))
    return EResult::AlreadyPresent;
  m_types.push_back({level, record});
  return EResult::Ok;
}

IResult Registry::Add(TerminalServer2::Level level, std::shared_ptr<NMX::IServerCallback> callback)
{
  if (!callback)
    return EResult::InvalidPointer;
  const auto& record = callback->Record();
  if (Taken(m_callbacks, record.name, [](const CallbackEntry& entry) { return entry.callback->Record().name; }))
    return EResult::AlreadyPresent;
  // A callback's arguments go out whatever their type says about direction.
  std::vector<std::string_view> names;
  for (const auto& argument : record.arguments)
    names.push_back(argument.name);
  m_callbacks.push_back({level, std::move(callback), std::move(names)});
  return EResult::Ok;
}

IResult Registry::Add(TerminalServer2::Level level, std::shared_ptr<NMX::IServerFunction> function)
{
  if (!function)
    return EResult::InvalidPointer;
  const auto& record = function->Record();
  if (FindFunction(record.name) != nullptr)
    return EResult::AlreadyPresent;
  auto inputs = NamesOf(record, function->Arguments(), TerminalServer2::EDirection::Input);
  auto outputs = NamesOf(record, function->Arguments(), TerminalServer2::EDirection::Output);
  m_functions.push_back(
      {level, std::move(function), std::move(inputs), std::move(outputs), ReadResultTexts(record.results)});
  m_functionsByName.emplace(m_functions.back().function->Record().name, &m_functions.back());
  return EResult::Ok;
}

void Registry::Clear()
{
  m_functionsByName.clear();
  m_functions.clear();
  m_callbacks.clear();
  m_types.clear();
}

const FunctionEntry* Registry::FindFunction(std::string_view name) const
{
  const auto found = m_functionsByName.find(name);
  return found != m_functionsByName.end() ? found->second : nullptr;
}

}
