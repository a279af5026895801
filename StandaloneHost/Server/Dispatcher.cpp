#include "StandaloneHost/Server/Dispatcher.h"

#include "StandaloneHost/Server/DescriptionParts.h"
#include "StandaloneHost/Server/Greeting.h"
#include "StandaloneHost/Server/JsonText.h"

#include <algorithm>
#include <utility>

namespace Server
{

using NMX::EResult;
using NMX::IResult;

namespace
{

void AppendHead(std::string& json, std::string_view id)
{
  json += "{\"jsonrpc\":\"2.0\",\"id\":";
  json += id;
}

std::string RpcErrorText(std::string_view id, int code, std::string_view message)
{
  std::string json;
  AppendHead(json, id);
  json += ",\"error\":{\"code\":";
  AppendNumber(json, std::int64_t{code});
  json += ",\"message\":";
  AppendString(json, message);
  json += "}}";
  return json;
}

void AppendCodeAndName(std::string& json, IResult result)
{
  json += "{\"code\":";
  AppendNumber(json, std::uint64_t{result.Code()});
  json += ",\"name\":";
  AppendString(json, result.Name());
}

std::string FailureText(std::string_view id, IResult result, std::string_view meaning, std::string_view detail)
{
  std::string json;
  json.reserve(192 + meaning.size() + detail.size());
  AppendHead(json, id);
  json += ",\"error\":{\"code\":";
  AppendNumber(json, std::int64_t{static_cast<std::int32_t>(result.Code())});
  json += ",\"message\":";
  AppendString(json, result.Name());
  json += ",\"data\":{\"code\":";
  AppendNumber(json, std::uint64_t{result.Code()});
  json += ",\"text\":";
  AppendString(json, meaning);
  if (!detail.empty())
  {
    json += ",\"detail\":";
    AppendString(json, detail);
  }
  json += "}}}";
  return json;
}

std::string ReplyText(std::string_view id, const FunctionEntry& entry, const NMX::IServerReply& reply)
{
  const IResult result = reply.Result();
  if (result.Failed())
    return FailureText(id, result, entry.Meaning(result), reply.Text());

  std::string json;
  json.reserve(128);
  AppendHead(json, id);
  json += ",\"result\":";
  AppendCodeAndName(json, result);
  json += ",\"outputs\":{";
  MemberWriter writer(json, entry.outputs);
  reply.WriteOutputs(writer);
  json += '}';
  if (const auto returned = reply.Returned())
    json += *returned ? ",\"returned\":true" : ",\"returned\":false";
  json += "}}";
  return json;
}

/// The values of by-name params in the order of `names`, as an array; or what is wrong with them.
std::optional<Complaint> OrderByName(std::string_view object, std::span<const std::string_view> names,
                                     const Limits& limits, std::string& array)
{
  const auto complain = [](std::string text) { return Complaint{RpcError::invalidParams, std::move(text)}; };
  std::vector<std::string_view> values(names.size());
  for (const auto& [name, value] : ReadMembers(object, limits))
  {
    const auto place = std::find(names.begin(), names.end(), name);
    if (place == names.end())
      return complain("Unknown parameter \"" + name + '"');
    auto& slot = values[static_cast<std::size_t>(place - names.begin())];
    if (!slot.empty())
      return complain("Parameter \"" + name + "\" is given twice");
    slot = value;
  }
  array = "[";
  for (std::size_t i = 0; i < values.size(); ++i)
  {
    if (values[i].empty())
      return complain("Parameter \"" + std::string(names[i]) + "\" is missing");
    if (i != 0)
      array += ',';
    array += values[i];
  }
  array += ']';
  return std::nullopt;
}

/// Gathers the answers to the calls of a batch.
struct Batch
{
  std::string text = "[";
  std::size_t open;
  std::size_t calls;
  Answer answer;

  void Take(const std::string& part)
  {
    if (!part.empty())
    {
      if (text.size() > 1)
        text += ',';
      text += part;
    }
    if (--open == 0)
      answer(text.size() > 1 ? text + ']' : std::string{}, calls);
  }
};

}

Dispatcher::Dispatcher(const Registry& registry, Notifier& notifier, const Limits& limits,
                       TerminalServer2::Level grantedLevel, std::string epoch)
    : m_registry(registry), m_notifier(notifier), m_limits(limits), m_grantedLevel(grantedLevel),
      m_epoch(std::move(epoch))
{
}

const ApiDocuments& Dispatcher::Api() const
{
  if (m_api.hash.empty())
    m_api = MakeApiDocuments(m_registry);
  return m_api;
}

std::string Dispatcher::Hello(std::uint64_t session) const
{
  return GreetingText({session, m_epoch, Api().hash, m_limits, m_grantedLevel});
}

std::size_t Dispatcher::Handle(std::string_view text, const NMX::Caller& caller, IListener* listener, Answer answer)
{
  const Message message = ReadMessage(text, m_limits);
  if (message.complaint)
  {
    answer(RpcErrorText("null", message.complaint->code, message.complaint->text), 1);
    return 1;
  }
  const std::size_t calls = message.requests.size();
  m_calls.store(Calls() + calls, std::memory_order_relaxed); // nobody else writes it
  if (!message.batch)
  {
    HandleRequest(message.requests.front(), caller, listener, std::move(answer));
    return 1;
  }
  const auto batch = std::make_shared<Batch>();
  batch->open = calls;
  batch->calls = calls;
  batch->answer = std::move(answer);
  for (const Request& request : message.requests)
    HandleRequest(request, caller, listener, [batch](const std::string& part, std::size_t) { batch->Take(part); });
  return calls;
}

void Dispatcher::HandleRequest(const Request& request, const NMX::Caller& caller, IListener* listener, Answer answer)
{
  const bool notification = request.id.empty();
  const auto answerNow = [&](std::string text) { answer(notification ? std::string{} : std::move(text), 1); };

  if (request.complaint)
    answer(RpcErrorText(request.id, request.complaint->code, request.complaint->text), 1);
  else if (const FunctionEntry* entry = m_registry.FindFunction(request.method))
  {
    if (entry->level < m_grantedLevel)
      answerNow(FailureText(request.id, EResult::NotPermitted, entry->Meaning(EResult::NotPermitted),
                            "a preview function; the host opens these with --level 1"));
    else
      Call(*entry, request, caller, std::move(answer));
  }
  else
    answerNow(CallServer(request, listener));
}

void Dispatcher::Call(const FunctionEntry& entry, const Request& request, const NMX::Caller& caller, Answer answer)
{
  std::string ordered;
  std::string_view arguments = request.params;
  if (arguments.front() == '{')
  {
    if (const auto complaint = OrderByName(arguments, entry.inputs, m_limits, ordered))
    {
      answer(request.id.empty() ? std::string{} : RpcErrorText(request.id, complaint->code, complaint->text), 1);
      return;
    }
    arguments = ordered;
  }
  // The entry stays until every call has been finished.
  entry.function->Invoke(
      arguments, caller,
      [id = std::string(request.id), &entry, answer = std::move(answer)](const NMX::IServerReply& finished)
      { answer(id.empty() ? std::string{} : ReplyText(id, entry, finished), 1); });
}

std::string Dispatcher::CallServer(const Request& request, IListener* listener)
{
  const bool describe = request.method == "rpc.discover";
  if (describe)
  {
    std::string json;
    AppendHead(json, request.id);
    json += ",\"result\":" + Api().functions + '}';
    return json;
  }
  for (const SubscriptionText& text : SubscriptionTexts())
    if (request.method == text.method)
      return Subscription(text, request, listener);
  return RpcErrorText(request.id, RpcError::methodNotFound, "Method not found: \"" + request.method + '"');
}

std::string Dispatcher::Subscription(const SubscriptionText& text, const Request& request, IListener* listener)
{
  static constexpr std::string_view parameter[] = {"Name"};
  std::string ordered(request.params);
  if (request.params.front() == '{')
    if (const auto complaint = OrderByName(request.params, parameter, m_limits, ordered))
      return RpcErrorText(request.id, complaint->code, complaint->text);
  const auto texts = ReadTexts(ordered);
  if (!texts || texts->size() != 1)
    return RpcErrorText(request.id, RpcError::invalidParams,
                        "expected one text: the name of a callback, or of a group with \".*\"");
  IResult result = EResult::NotSupported;
  if (listener != nullptr)
    result = text.method == "Server.Subscribe" ? m_notifier.Subscribe(texts->front(), *listener, m_grantedLevel)
                                               : m_notifier.Unsubscribe(texts->front(), *listener);
  if (result.Failed())
  {
    const auto failure = std::find_if(text.failures.begin(), text.failures.end(),
                                      [&](const DocumentedFailure& documented) { return result == documented.code; });
    return FailureText(request.id, result, failure == text.failures.end() ? std::string_view{} : failure->text, {});
  }

  std::string json;
  AppendHead(json, request.id);
  json += ",\"result\":";
  AppendCodeAndName(json, result);
  json += ",\"outputs\":{},\"epoch\":";
  AppendString(json, m_epoch);
  json += ",\"sequence\":";
  AppendNumber(json, m_notifier.Sequence());
  json += "}}";
  return json;
}

}
