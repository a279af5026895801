#include "StandaloneHost/Server/Description.h"

#include "StandaloneHost/Server/DescriptionParts.h"

#include <boost/json.hpp>

#include <string_view>

namespace Server
{

namespace json = boost::json;
using NMX::EResult;
using NMX::IResult;
using TerminalServer2::EDirection;

namespace
{

json::array EnumerationValues(const TerminalServer2::TypeRecord& record)
{
  json::array values;
  for (const auto& value : record.values)
    values.push_back({{"name", value.name}, {"value", value.number}, {"description", value.text}});
  return values;
}

json::object Parameter(std::string_view name, std::string_view description, json::object schema)
{
  return {{"name", name}, {"description", description}, {"required", true}, {"schema", std::move(schema)}};
}

json::object DescribeFailure(IResult code, std::string_view text)
{
  return {{"code", static_cast<std::int32_t>(code.Code())},
          {"message", code.Name()},
          {"data", {{"code", code.Code()}, {"text", text}}}};
}

/// With the mark of what should no longer be used, where its documentation says so.
json::object Marked(json::object described)
{
  if (IsDeprecated(described.at("description").as_string()))
    described["deprecated"] = true;
  return described;
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
    json::object schema = ArgumentSchema(types[i], method + '.' + std::string(name));
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
      errors.push_back(DescribeFailure(code, text));

  return Marked(
      {{"name", record.name},
       {"description", record.description},
       {"tags", {{{"name", GroupOf(record.name)}}}},
       {"paramStructure", "either"},
       {"params", std::move(params)},
       {"result",
        {{"name", "Result"}, {"schema", ResultSchema(method, std::move(outputs), entry.function->ReturnsTruth())}}},
       {"errors", std::move(errors)},
       {"x-group", GroupOf(record.name)},
       {"x-level", entry.level},
       {"x-resultDocumentation", record.results}});
}

json::object DescribeCallback(const CallbackEntry& entry)
{
  const auto& record = entry.callback->Record();
  const auto types = entry.callback->Arguments();
  json::array params;
  for (std::size_t i = 0; i < types.size() && i < record.arguments.size(); ++i)
    params.push_back(
        Parameter(record.arguments[i].name, record.arguments[i].text,
                  ArgumentSchema(types[i], std::string(record.name) + '.' + std::string(record.arguments[i].name))));
  return Marked({{"name", record.name},
                 {"description", record.description},
                 {"params", std::move(params)},
                 {"x-group", GroupOf(record.name)},
                 {"x-level", entry.level}});
}

json::object DescribeType(const TypeEntry& entry)
{
  return {{"name", entry.record.name},
          {"description", entry.record.description},
          {"x-level", entry.level},
          {"values", EnumerationValues(entry.record)}};
}

json::object DescribeSubscription(const SubscriptionText& text)
{
  const std::string method(text.method);
  json::array errors;
  for (const DocumentedFailure& failure : text.failures)
    errors.push_back(DescribeFailure(failure.code, failure.text));
  return {{"name", text.method},
          {"description", text.description},
          {"tags", {{{"name", GroupOf(text.method)}}}},
          {"paramStructure", "either"},
          {"params", {Parameter("Name", subscriptionNameText, {{"title", method + ".Name"}, {"type", "string"}})}},
          {"result", {{"name", "Result"}, {"schema", SubscriptionResultSchema(method)}}},
          {"errors", std::move(errors)},
          {"x-group", GroupOf(text.method)},
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

json::object DescribeResult(IResult result)
{
  return {{"name", result.Name()}, {"code", result.Code()}};
}

/// Every code that an answer may carry, with its name.
json::array DescribeResults()
{
  json::array results;
  for (const EResult first : {EResult::Ok, EResult::Failed})
    for (IResult result = first; !result.Name().empty(); result = IResult(result.Code() + 1))
      results.push_back(DescribeResult(result));
  results.push_back(DescribeResult(EResult::NoResult));
  return results;
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
  for (const SubscriptionText& text : SubscriptionTexts())
    methods.push_back(DescribeSubscription(text));
  methods.push_back(DescribeDiscovery());

  return json::serialize(json::object{
      {"openrpc", "1.3.2"},
      {"info",
       {{"title", "Subject store remote control"},
        {"version", "1.0.0"},
        {"description",
         "Remote control of the subjects of a capture stage. Failures carry the result code as a signed "
         "32-bit number; functions of level 1 are a preview. The notifications are described by asyncapi.json."}}},
      {"methods", std::move(methods)},
      {"x-callbacks", List(registry.Callbacks(), DescribeCallback)},
      {"x-types", List(registry.Types(), DescribeType)},
      {"x-results", DescribeResults()}});
}

}
