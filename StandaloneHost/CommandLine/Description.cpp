#include "StandaloneHost/CommandLine/Description.h"

#include "StandaloneHost/CommandLine/CommandError.h"

#include <boost/json.hpp>

#include <algorithm>

namespace CommandLine
{

namespace json = boost::json;

namespace
{

/// A member, or null for what is missing: a host of another revision may say less.
const json::value& At(const json::value& value, const char* name)
{
  static const json::value none;
  const json::object* object = value.if_object();
  const json::value* member = object == nullptr ? nullptr : object->if_contains(name);
  return member == nullptr ? none : *member;
}

std::string TextAt(const json::value& value, const char* name)
{
  const json::string* text = At(value, name).if_string();
  return text == nullptr ? std::string{} : std::string(*text);
}

template <class Take>
void ForEach(const json::value& list, Take take)
{
  if (const json::array* array = list.if_array())
    for (const json::value& element : *array)
      take(element);
}

EType TypeOf(const json::value& schema)
{
  const std::string type = TextAt(schema, "type");
  if (type == "boolean")
    return EType::Truth;
  if (type == "integer")
    return TextAt(schema, "x-enumeration").empty() ? EType::WholeNumber : EType::Enumeration;
  if (type == "number")
    return EType::Number;
  if (type == "string")
    return EType::Text;
  if (type != "array")
    return EType::Other;
  if (TextAt(At(schema, "items"), "type") == "array")
    return EType::Warnings;
  return At(schema, "uniqueItems").is_bool() ? EType::TextSet : EType::TextList;
}

Argument ReadArgument(std::string name, std::string text, const json::value& schema)
{
  Argument argument{std::move(name), std::move(text), TypeOf(schema), TextAt(schema, "x-enumeration")};
  if (argument.type == EType::Warnings)
    ForEach(At(At(schema, "items"), "items"),
            [&](const json::value& item)
            {
              if (argument.enumeration.empty())
                argument.enumeration = TextAt(item, "x-enumeration");
            });
  return argument;
}

std::string NameOf(const json::value& entry, const char* what)
{
  std::string name = TextAt(entry, "name");
  if (name.empty())
    throw HostError(std::string("the host's description is not as expected: a ") + what + " has no name");
  return name;
}

std::string GroupOf(const std::string& name)
{
  return name.substr(0, name.find('.'));
}

Function ReadFunction(const json::value& entry)
{
  Function function;
  function.name = NameOf(entry, "function");
  function.text = TextAt(entry, "description");
  function.group = GroupOf(function.name);
  function.preview = At(entry, "x-level") == json::value(1);
  ForEach(At(entry, "params"),
          [&](const json::value& input)
          {
            function.inputs.push_back(
                ReadArgument(NameOf(input, "parameter"), TextAt(input, "description"), At(input, "schema")));
          });
  const json::value& answer = At(At(At(entry, "result"), "schema"), "properties");
  if (const json::object* outputs = At(At(answer, "outputs"), "properties").if_object())
    for (const auto& output : *outputs)
      function.outputs.push_back(
          ReadArgument(std::string(output.key()), TextAt(output.value(), "description"), output.value()));
  function.returnsTruth = At(answer, "returned").is_object();
  function.results = TextAt(entry, "x-resultDocumentation");
  function.json = json::serialize(entry);
  return function;
}

Enumeration ReadEnumeration(const json::value& entry)
{
  Enumeration enumeration;
  enumeration.name = NameOf(entry, "type");
  enumeration.text = TextAt(entry, "description");
  enumeration.group = GroupOf(enumeration.name);
  ForEach(At(entry, "values"),
          [&](const json::value& value)
          {
            enumeration.values.push_back(
                {json::serialize(At(value, "value")), NameOf(value, "value"), TextAt(value, "description")});
          });
  enumeration.json = json::serialize(entry);
  return enumeration;
}

template <class Entry>
const Entry* Find(const std::vector<Entry>& entries, std::string_view name)
{
  const auto found =
      std::find_if(entries.begin(), entries.end(), [name](const Entry& entry) { return entry.name == name; });
  return found == entries.end() ? nullptr : &*found;
}

/// Groups are in the list of types, without a "." in the name; one that has functions may be missing there.
void ReadGroups(Description& description, const json::value& types)
{
  ForEach(types,
          [&](const json::value& type)
          {
            if (TextAt(type, "name").find('.') != std::string::npos)
              description.enumerations.push_back(ReadEnumeration(type));
            else
              description.groups.push_back({NameOf(type, "group"), TextAt(type, "description")});
          });
  for (const Function& function : description.functions)
    if (Find(description.groups, function.group) == nullptr)
      description.groups.push_back({function.group, ""});
}

}

const Function* Description::FindFunction(std::string_view name) const
{
  return Find(functions, name);
}

const Function* Description::FindCallback(std::string_view name) const
{
  return Find(callbacks, name);
}

const Enumeration* Description::FindEnumeration(std::string_view name) const
{
  return Find(enumerations, name);
}

std::string ValueName(const Description& description, std::string_view enumeration, std::string_view number)
{
  if (const Enumeration* known = description.FindEnumeration(enumeration))
    for (const EnumerationValue& value : known->values)
      if (value.number == number)
        return value.name;
  return {};
}

std::string TypeName(const Argument& argument)
{
  switch (argument.type)
  {
  case EType::Truth:
    return "truth value";
  case EType::WholeNumber:
    return "whole number";
  case EType::Number:
    return "number";
  case EType::Text:
    return "text";
  case EType::TextSet:
    return "set of texts";
  case EType::TextList:
    return "list of texts";
  case EType::Enumeration:
    return argument.enumeration;
  case EType::Warnings:
    return "warnings (" + argument.enumeration + ')';
  case EType::Other:
    break;
  }
  return "JSON";
}

Description ReadDescription(const std::string& text)
{
  json::error_code error;
  const json::value document = json::parse(text, error);
  if (error)
    throw HostError("the host's description is not JSON: " + error.message());
  if (!At(document, "methods").is_array())
    throw HostError("the host's description is not as expected: it has no methods");
  Description description;
  ForEach(At(document, "methods"),
          [&](const json::value& entry) { description.functions.push_back(ReadFunction(entry)); });
  ForEach(At(document, "x-callbacks"),
          [&](const json::value& entry) { description.callbacks.push_back(ReadFunction(entry)); });
  ReadGroups(description, At(document, "x-types"));
  description.json = text;
  return description;
}

Description FetchDescription(Client& client)
{
  const Answer answer = client.Call("rpc.discover", "[]");
  if (answer.failed)
    throw HostError(client.Host().Url() + " does not describe what it offers");
  return ReadDescription(answer.json);
}

}
