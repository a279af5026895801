#include "StandaloneHost/Server/EventDescription.h"

#include "StandaloneHost/Server/DescriptionParts.h"
#include "StandaloneHost/Server/Greeting.h"

#include <boost/json.hpp>

#include <string_view>
#include <utility>

namespace Server
{

namespace json = boost::json;

namespace
{

constexpr std::string_view channelPointer = "#/channels/rpc";

json::object Reference(std::string pointer)
{
  return {{"$ref", std::move(pointer)}};
}

json::array MessageReferences(std::initializer_list<std::string> names)
{
  json::array references;
  for (const std::string& name : names)
    references.push_back(Reference(std::string(channelPointer) + "/messages/" + name));
  return references;
}

json::object ConstantSchema(const std::string& title, std::string_view value)
{
  return {{"title", title}, {"type", "string"}, {"const", value}};
}

/// The schema of a JSON-RPC message: what every one has, then `members`.
json::object EnvelopeSchema(const std::string& title, json::object members)
{
  json::object properties{{"jsonrpc", ConstantSchema(title + ".JsonRpc", "2.0")}};
  for (auto& member : members)
    properties[member.key()] = std::move(member.value());
  return ObjectSchema(title, std::move(properties));
}

json::object IdSchema(const std::string& title)
{
  return {{"title", title}, {"type", {"string", "number"}}, {"description", "The same in a call and its answer."}};
}

json::object Message(std::string_view name, std::string_view description, json::object payload)
{
  return {{"name", name},
          {"title", name},
          {"description", description},
          {"contentType", "application/json"},
          {"payload", std::move(payload)}};
}

json::object CorrelatedMessage(std::string_view name, std::string_view description, json::object payload)
{
  json::object message = Message(name, description, std::move(payload));
  message["correlationId"] = {{"location", "$message.payload#/id"}};
  return message;
}

/// The channel's messages and the operations on them, as they come together.
struct Parts
{
  json::object messages;
  json::object operations;

  void Add(const std::string& name, std::string_view action, std::string_view description, json::object more)
  {
    json::object operation{{"action", action},
                           {"channel", Reference(std::string(channelPointer))},
                           {"description", description},
                           {"tags", {{{"name", GroupOf(name)}}}},
                           {"messages", MessageReferences({name})}};
    for (auto& member : more)
      operation[member.key()] = std::move(member.value());
    operations[name] = std::move(operation);
  }

  /// What the server tells of its own accord.
  void AddNotification(const std::string& name, std::string_view description, json::object params, json::object marks)
  {
    json::object payload =
        EnvelopeSchema(name + ".Notification", {{"method", ConstantSchema(name + ".Method", name)},
                                                {"params", ObjectSchema(name + ".Params", std::move(params))}});
    messages[name] = Message(name, description, std::move(payload));
    Add(name, "send", description, std::move(marks));
  }
};

json::object Marks(TerminalServer2::Level level, std::string_view name, std::string_view description)
{
  json::object marks{{"x-group", GroupOf(name)}, {"x-level", level}};
  if (IsDeprecated(description))
    marks["x-deprecated"] = true;
  return marks;
}

void DescribeCallback(Parts& parts, const CallbackEntry& entry)
{
  const auto& record = entry.callback->Record();
  const auto types = entry.callback->Arguments();
  const std::string name(record.name);
  json::object params;
  for (std::size_t i = 0; i < types.size() && i < record.arguments.size(); ++i)
  {
    const auto& [argument, text] = record.arguments[i];
    json::object schema = ArgumentSchema(types[i], name + '.' + std::string(argument));
    schema["description"] = text;
    params[argument] = std::move(schema);
  }
  params["sequence"] = SequenceSchema(name + ".Sequence", "Counts the notifications of the whole server.");
  parts.AddNotification(name, record.description, std::move(params),
                        Marks(entry.level, record.name, record.description));
}

/// The argument of a subscription, by position or by name.
json::object SubscriptionParams(const std::string& method)
{
  json::object array{{"title", method + ".ByPosition"},
                     {"type", "array"},
                     {"items", TextSchema(method + ".ByPosition.Item", subscriptionNameText)},
                     {"minItems", 1},
                     {"maxItems", 1}};
  json::object object =
      ObjectSchema(method + ".ByName", {{"Name", TextSchema(method + ".Name", subscriptionNameText)}});
  return {{"title", method + ".Params"}, {"oneOf", {std::move(array), std::move(object)}}};
}

json::object FailureSchema(const std::string& title)
{
  json::object properties{
      {"code",
       {{"title", title + ".Code"},
        {"type", "integer"},
        {"description", "The result code as a signed 32-bit number, or an error code of JSON-RPC."}}},
      {"message", TextSchema(title + ".Message", "Name of the result code, or what is wrong with the call.")}};
  json::object data = ObjectSchema(
      title + ".Data",
      {{"code", {{"title", title + ".Data.Code"}, {"type", "integer"}, {"description", "The result code."}}},
       {"text", TextSchema(title + ".Text", "What the code means here; may be empty.")}});
  json::object schema = ObjectSchema(title, std::move(properties));
  schema["properties"].as_object()["data"] = std::move(data); // errors of JSON-RPC have none
  return schema;
}

void DescribeSubscription(Parts& parts, const SubscriptionText& text)
{
  const std::string method(text.method);
  const std::string success = method + ".Success";
  const std::string failure = method + ".Failure";
  parts.messages[method] =
      CorrelatedMessage(method, text.description,
                        EnvelopeSchema(method + ".Call", {{"id", IdSchema(method + ".Call.Id")},
                                                          {"method", ConstantSchema(method + ".Method", method)},
                                                          {"params", SubscriptionParams(method)}}));
  parts.messages[success] = CorrelatedMessage(
      success, "The answer to a call that succeeded.",
      EnvelopeSchema(success, {{"id", IdSchema(success + ".Id")}, {"result", SubscriptionResultSchema(method)}}));
  parts.messages[failure] = CorrelatedMessage(
      failure, "The answer to a call that failed.",
      EnvelopeSchema(failure, {{"id", IdSchema(failure + ".Id")}, {"error", FailureSchema(failure + ".Error")}}));
  json::object more = Marks(2, method, text.description);
  more["reply"] = {{"channel", Reference(std::string(channelPointer))},
                   {"messages", MessageReferences({success, failure})}};
  parts.Add(method, "receive", text.description, std::move(more));
}

}

std::string DescribeEvents(const Registry& registry)
{
  static constexpr std::string_view greeting = "Greets a client; the first message of each connection.";
  Parts parts;
  parts.AddNotification(std::string(greetingMethod), greeting, GreetingMembers(), Marks(2, greetingMethod, greeting));
  for (const CallbackEntry& entry : registry.Callbacks())
    DescribeCallback(parts, entry);
  for (const SubscriptionText& text : SubscriptionTexts())
    DescribeSubscription(parts, text);

  return json::serialize(json::object{
      {"asyncapi", "3.0.0"},
      {"info",
       {{"title", "Subject store notifications"},
        {"version", "1.0.0"},
        {"description", "What the server tells a client over a WebSocket. The functions are described by openrpc.json. "
                        "Operations are named from the server's point of view: what it sends, a client receives."}}},
      {"defaultContentType", "application/json"},
      {"servers",
       {{"host",
         {{"host", "{address}:{port}"},
          {"protocol", "ws"},
          {"description", "The standalone host."},
          {"variables",
           {{"address", {{"default", "127.0.0.1"}, {"description", "Where the host listens."}}},
            {"port", {{"default", "8420"}, {"description", "The port that it was told to take."}}}}}}}}},
      {"channels",
       {{"rpc",
         {{"address", "/rpc"},
          {"description", "JSON-RPC 2.0 in text frames: calls and their answers, and notifications."},
          {"servers", json::array{Reference("#/servers/host")}},
          {"messages", std::move(parts.messages)},
          {"bindings", {{"ws", {{"method", "GET"}}}}}}}}},
      {"operations", std::move(parts.operations)}});
}

}
