#include "StandaloneHost/Server/DescriptionParts.h"

#include <boost/json.hpp>

#include <utility>

namespace Server
{

namespace json = boost::json;
using NMX::EResult;
using TerminalServer2::ArgumentType;
using TerminalServer2::EArgumentType;
using TerminalServer2::EDirection;

namespace
{

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

constexpr DocumentedFailure subscribeFailures[] = {
    {EResult::NotFound, "No callback with that name."},
    {EResult::NotPermitted, "A preview callback; the host opens these with --level 1."},
    {EResult::AllocationFailure, "Too many subscriptions on this connection."},
    {EResult::NotSupported, "Notifications need a WebSocket."}};

constexpr DocumentedFailure unsubscribeFailures[] = {{EResult::NotFound, "No callback with that name."},
                                                     {EResult::NotSupported, "Notifications need a WebSocket."}};

constexpr SubscriptionText subscriptionTexts[] = {
    {"Server.Subscribe", "Ask to be notified of changes on this connection. Needs a WebSocket.", subscribeFailures},
    {"Server.Unsubscribe", "Ask to be notified no longer on this connection. Needs a WebSocket.", unsubscribeFailures}};

}

std::span<const SubscriptionText> SubscriptionTexts()
{
  return subscriptionTexts;
}

std::string_view GroupOf(std::string_view name)
{
  return name.substr(0, name.find('.'));
}

bool IsDeprecated(std::string_view description)
{
  return description.starts_with("@deprecated");
}

json::object ArgumentSchema(const ArgumentType& type, const std::string& title)
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

json::object SequenceSchema(const std::string& title, std::string_view description)
{
  json::object schema = ArgumentSchema({EArgumentType::UInt64, EDirection::Output}, title);
  schema["description"] = description;
  return schema;
}

json::object CountSchema(const std::string& title, std::string_view description)
{
  return {{"title", title}, {"type", "integer"}, {"minimum", 0}, {"description", description}};
}

json::object TextSchema(const std::string& title, std::string_view description)
{
  return {{"title", title}, {"type", "string"}, {"description", description}};
}

json::object ObjectSchema(const std::string& title, json::object properties)
{
  json::array required;
  for (const auto& property : properties)
    required.emplace_back(property.key());
  return {
      {"title", title}, {"type", "object"}, {"properties", std::move(properties)}, {"required", std::move(required)}};
}

json::object ResultSchema(const std::string& method, json::object outputs, bool returnsTruth)
{
  json::object properties{{"code", {{"title", method + ".Result.Code"}, {"type", "integer"}, {"minimum", 0}}},
                          {"name", {{"title", method + ".Result.Name"}, {"type", "string"}}},
                          {"outputs", ObjectSchema(method + ".Outputs", std::move(outputs))}};
  if (returnsTruth)
    properties["returned"] = {{"title", method + ".Result.Returned"}, {"type", "boolean"}};
  return ObjectSchema(method + ".Result", std::move(properties));
}

json::object SubscriptionResultSchema(const std::string& method)
{
  json::object schema = ResultSchema(method, {}, false);
  json::object properties = std::move(schema["properties"].as_object());
  properties["epoch"] = TextSchema(method + ".Epoch", "New at each start of the host.");
  properties["sequence"] = SequenceSchema(method + ".Sequence", "Later notifications have a greater one.");
  return ObjectSchema(method + ".Result", std::move(properties));
}

}
