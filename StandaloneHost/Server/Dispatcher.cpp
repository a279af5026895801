#include "StandaloneHost/Server/Dispatcher.h"

#include "StandaloneHost/Server/DescriptionParts.h"
#include "StandaloneHost/Server/Greeting.h"
#include "StandaloneHost/Server/Responses.h"

#include <algorithm>
#include <utility>

namespace Server
{

using NMX::EResult;
using NMX::IResult;

namespace
{

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

}

/// Gathers the responses to the calls of a batch.
struct Dispatcher::Batch
{
  Batch(std::shared_ptr<OutgoingBytes> outgoing, std::size_t count, Answer whole)
      : held(std::move(outgoing)), open(count), calls(count), answer(std::move(whole))
  {
  }

  /// Takes a response in. One that is too long is replaced, and calls that have not begun are not carried out from then
  /// on. What is no success is short.
  void Take(std::string_view id, ResponseText part, IResult result)
  {
    if (result.Succeeded() && !Fits(part))
    {
      full = true;
      part = TooLongText(id, result);
    }
    if (!part.Empty())
    {
      if (text.Size() > 1)
        text.Append(",");
      text.Append(std::move(part));
      held.Set(text.OwnBytes());
    }
    if (--open == 0)
      Finish();
  }

  [[nodiscard]] bool Fits(const ResponseText& part) const
  {
    return text.Size() + part.Size() <= held.Longest() && held.MayAdd(part.OwnBytes());
  }

  void Finish()
  {
    if (text.Size() > 1)
      text.Append("]");
    else
      text = {};
    held.Set(0); // whoever sends it counts it
    answer(std::move(text), calls);
  }

  HeldBytes held;
  ResponseText text{"["};
  std::size_t open;
  std::size_t calls;
  bool full = false;
  Answer answer;
};

void Dispatcher::Recipient::Take(std::string_view id, ResponseText text, IResult result) const
{
  if (batch)
    return batch->Take(id, std::move(text), result);
  if (result.Succeeded() && !(text.Size() <= outgoing->Longest() && outgoing->MayAdd(0, text.OwnBytes())))
    text = TooLongText(id, result);
  answer(std::move(text), 1);
}

Dispatcher::Dispatcher(const Registry& registry, Notifier& notifier, const Limits& limits,
                       std::shared_ptr<OutgoingBytes> outgoing, TerminalServer2::Level grantedLevel, std::string epoch)
    : m_registry(registry), m_notifier(notifier), m_limits(limits), m_outgoing(std::move(outgoing)),
      m_grantedLevel(grantedLevel), m_epoch(std::move(epoch))
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
    HandleRequest(message.requests.front(), caller, listener, {std::move(answer), nullptr, m_outgoing.get()});
    return 1;
  }
  const auto batch = std::make_shared<Batch>(m_outgoing, calls, std::move(answer));
  for (const Request& request : message.requests)
  {
    if (batch->full && !request.complaint)
      batch->Take(request.id, request.id.empty() ? ResponseText{} : NotBegunText(request.id), EResult::Failed);
    else
      HandleRequest(request, caller, listener, {nullptr, batch, m_outgoing.get()});
  }
  return calls;
}

void Dispatcher::HandleRequest(const Request& request, const NMX::Caller& caller, IListener* listener,
                               Recipient recipient)
{
  const auto refuse = [&](std::string text)
  { recipient.Take(request.id, request.id.empty() ? ResponseText{} : std::move(text), EResult::Failed); };

  if (request.complaint)
    refuse(RpcErrorText(request.id, request.complaint->code, request.complaint->text));
  else if (const FunctionEntry* entry = m_registry.FindFunction(request.method))
  {
    if (entry->level < m_grantedLevel)
      refuse(FailureText(request.id, EResult::NotPermitted, entry->Meaning(EResult::NotPermitted),
                         "a preview function; the host opens these with --level 1"));
    else
      Call(*entry, request, caller, std::move(recipient));
  }
  else
    CallServer(request, listener, recipient);
}

void Dispatcher::Call(const FunctionEntry& entry, const Request& request, const NMX::Caller& caller,
                      Recipient recipient)
{
  std::string ordered;
  std::string_view arguments = request.params;
  if (arguments.front() == '{')
  {
    if (const auto complaint = OrderByName(arguments, entry.inputs, m_limits, ordered))
      return recipient.Take(
          request.id, request.id.empty() ? std::string{} : RpcErrorText(request.id, complaint->code, complaint->text),
          EResult::Failed);
    arguments = ordered;
  }
  // The entry stays until every call has been finished.
  entry.function->Invoke(
      arguments, caller,
      [id = std::string(request.id), &entry, recipient = std::move(recipient)](const NMX::IServerReply& finished)
      { recipient.Take(id, id.empty() ? std::string{} : ReplyText(id, entry, finished), finished.Result()); });
}

void Dispatcher::CallServer(const Request& request, IListener* listener, const Recipient& recipient)
{
  ResponseText text;
  if (request.method == "rpc.discover")
    text = SharedResultText(request.id, Api().functions);
  else
    text = Subscribe(request, listener);
  recipient.Take(request.id, request.id.empty() ? ResponseText{} : std::move(text), EResult::Ok);
}

std::string Dispatcher::Subscribe(const Request& request, IListener* listener)
{
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

  return SubscribedText(request.id, result, m_epoch, m_notifier.Sequence());
}

}
