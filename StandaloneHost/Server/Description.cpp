#include "StandaloneHost/Server/Description.h"

#include <boost/json.hpp>

#include <string_view>

namespace Server
{

namespace json = boost::json;
using TerminalServer2::ArgumentType;
using TerminalServer2::EArgumentType;
using TerminalServer2::EDirection;

namespace
{

std::string_view GroupOf(std::string_view name)
{
  return name.substr(0, name.find('.'));
}

json::array EnumerationValues(const TerminalServer2::TypeRecord& record)
{
  json::array values;
  for (const auto& value : record.values)
    values.push_back({{"name", value.name}, {"value", value.number}, {"description", value.text}});
  return values;
}

/// The type of an enumeration's number, with what each value is called.
void DescribeEnumeration(json::object& schema, const TerminalServer2::TypeRecord& record)
{
  schema["type"] = "integer";
  json::array numbers;
  for (const auto& value : record.values)
    numbers.push_back(value.number);
  schema["enum"] = std::move(numbers);
  schema["x-enumeration"] = record.name;
}

/// `title` is unique in the document: generators of clients name their types after it.
json::object Schema(const ArgumentType& type, const std::string& title)
{
  json::object schema{{"title", title}};
  switch (type.type)
  {
  case EArgumentType::Bool:
    schema["type"] = "boolean";
    break;
  case EArgumentType::UInt32:
  case EArgumentType::SessionId:
    schema["type"] = "integer";
    schema["minimum"] = 0;
    schema["maximum"] = 4294967295U;
    break;
  case EArgumentType::UInt64:
    schema["type"] = "integer";
    schema["minimum"] = 0;
    schema["maximum"] = 18446744073709551615U;
    break;
  case EArgumentType::Double:
    schema["type"] = "number";
    break;
  case EArgumentType::Text:
    schema["type"] = "string";
    break;
  case EArgumentType::TextSet:
    schema["uniqueItems"] = true;
    [[fallthrough]];
  case EArgumentType::TextList:
    schema["type"] = "array";
    schema["items"] = {{"title", title + ".Item"}, {"type", "string"}};
    break;
  case EArgumentType::Enumeration:
    DescribeEnumeration(schema, *type.enumeration);
    break;
  case EArgumentType::WarningMap:
  {
    json::object number{{"title", title + ".Number"}};
    DescribeEnumeration(number, *type.enumeration);
    schema["type"] = "array";
    schema["items"] = {{"title", title + ".Item"},
                       {"type", "array"},
                       {"description", "A value of the enumeration and its text."},
                       {"items", {std::move(number), {{"title", title + ".Text"}, {"type", "string"}}}},
                       {"minItems", 2},
                       {"maxItems", 2}};
    break;
  }
  }
  return schema;
}

json::object Parameter(std::string_view name, std::string_view description, json::object schema)
{
  return {{"name", name}, {"description", description}, {"required", true}, {"schema", std::move(schema)}};
}

/// The schema of a successful answer with the given outputs.
json::object ResultSchema(const std::string& method, json::object outputs, bool returnsTruth)
{
  json::array names;
  for (const auto& output : outputs)
    names.emplace_back(output.key());
  json::object properties{{"code", {{"title", method + ".Result.Code"}, {"type", "integer"}, {"minimum", 0}}},
                          {"name", {{"title", method + ".Result.Name"}, {"type", "string"}}},
                          {"outputs",
                           {{"title", method + ".Outputs"},
                            {"type", "object"},
                            {"properties", std::move(outputs)},
                            {"required", std::move(names)}}}};
  json::array required{"code", "name", "outputs"};
  if (returnsTruth)
  {
    properties["returned"] = {{"title", method + ".Result.Returned"}, {"type", "boolean"}};
    required.emplace_back("returned");
  }
  return {{"title", method + ".Result"},
          {"type", "object"},
          {"properties", std::move(properties)},
          {"required", std::move(required)}};
}

json::object DescribeFunction(const FunctionEntry& entry)
{
  const auto& record = entry.function->Record();
  const auto types = entry.function->Arguments();
  const std::string method(record.name);

  json::array params;
  json::object outputs;
  for (std::size_t i = 0; i < types.size() && i < record.arguments.size(); ++i)
  {
    const auto& [name, text] = record.arguments[i];
    json::object schema = Schema(types[i], method + '.' + std::string(name));
    if (types[i].direction == EDirection::Input)
      params.push_back(Parameter(name, text, std::move(schema)));
    else
    {
      schema["description"] = text;
      outputs[name] = std::move(schema);
    }
  }
  json::array errors;
  for (const auto& [code, text] : entry.results)
    if (code.Failed())
      errors.push_back({{"code", static_cast<std::int32_t>(code.Code())},
                        {"message", code.Name()},
                        {"data", {{"code", code.Code()}, {"text", text}}}});

  return {{"name", record.name},
          {"description", record.description},
          {"tags", {{{"name", GroupOf(record.name)}}}},
          {"paramStructure", "either"},
          {"params", std::move(params)},
          {"result",
           {{"name", "Result"}, {"schema", ResultSchema(method, std::move(outputs), entry.function->ReturnsTruth())}}},
          {"errors", std::move(errors)},
          {"x-group", GroupOf(record.name)},
          {"x-level", entry.level},
          {"x-resultDocumentation", record.results}};
}

json::object DescribeCallback(const CallbackEntry& entry)
{
  const auto& record = entry.callback->Record();
  const auto types = entry.callback->Arguments();
  json::array params;
  for (std::size_t i = 0; i < types.size() && i < record.arguments.size(); ++i)
    params.push_back(
        Parameter(record.arguments[i].name, record.arguments[i].text,
                  Schema(types[i], std::string(record.name) + '.' + std::string(record.arguments[i].name))));
  return {{"name", record.name},
          {"description", record.description},
          {"params", std::move(params)},
          {"x-group", GroupOf(record.name)},
          {"x-level", entry.level}};
}

json::object DescribeType(const TypeEntry& entry)
{
  return {{"name", entry.record.name},
          {"description", entry.record.description},
          {"x-level", entry.level},
          {"values", EnumerationValues(entry.record)}};
}

json::object DescribeSubscription(std::string_view method, std::string_view description)
{
  const std::string name(method);
  json::object result = ResultSchema(name, {}, false);
  json::object& properties = result["properties"].as_object();
  properties["epoch"] = {
      {"title", name + ".Epoch"}, {"type", "string"}, {"description", "New at each start of the host."}};
  properties["sequence"] = {{"title", name + ".Sequence"},
                            {"type", "integer"},
                            {"minimum", 0},
                            {"description", "Later notifications have a greater one."}};
  return {{"name", method},
          {"description", description},
          {"tags", {{{"name", "Server"}}}},
          {"paramStructure", "either"},
          {"params",
           {Parameter("Name", "Name of a callback, or of a group followed by \".*\" for all its callbacks.",
                      {{"title", name + ".Name"}, {"type", "string"}})}},
          {"result", {{"name", "Result"}, {"schema", std::move(result)}}},
          {"x-group", "Server"},
          {"x-level", 2}};
}

json::object DescribeDiscovery()
{
  return {
      {"name", "rpc.discover"},
      {"description", "This description."},
      {"tags", {{{"name", "Server"}}}},
      {"params", json::array{}},
      {"result", {{"name", "Description"}, {"schema", {{"title", "rpc.discover.Description"}, {"type", "object"}}}}},
      {"x-group", "Server"},
      {"x-level", 2}};
}

template <class Entries, class Describe>
json::array List(const Entries& entries, Describe describe)
{
  json::array list;
  for (const auto& entry : entries)
    list.push_back(describe(entry));
  return list;
}

}

std::string DescribeApi(const Registry& registry)
{
  json::array methods = List(registry.Functions(), DescribeFunction);
  methods.push_back(
      DescribeSubscription("Server.Subscribe", "Ask to be notified of changes on this connection. Needs a WebSocket."));
  methods.push_back(DescribeSubscription("Server.Unsubscribe",
                                         "Ask to be notified no longer on this connection. Needs a WebSocket."));
  methods.push_back(DescribeDiscovery());

  return json::serialize(json::object{
      {"openrpc", "1.3.2"},
      {"info",
       {{"title", "Subject store remote control"},
        {"version", "1.0.0"},
        {"description", "Remote control of the subjects of a capture stage. Failures carry the result code as a signed "
                        "32-bit number; functions of level 1 are a preview."}}},
      {"methods", std::move(methods)},
      {"x-callbacks", List(registry.Callbacks(), DescribeCallback)},
      {"x-types", List(registry.Types(), DescribeType)}});
}

}
