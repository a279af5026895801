#include "StandaloneHost/Server/Responses.h"

#include "StandaloneHost/Server/Envelope.h"
#include "StandaloneHost/Server/JsonText.h"

#include <utility>

namespace Server
{

using NMX::IResult;

namespace
{

void AppendHead(std::string& json, std::string_view id)
{
  json += "{\"jsonrpc\":\"2.0\",\"id\":";
  json += id;
}

void AppendCodeAndName(std::string& json, IResult result)
{
  json += "{\"code\":";
  AppendNumber(json, std::uint64_t{result.Code()});
  json += ",\"name\":";
  AppendString(json, result.Name());
}

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

std::string TooLongText(std::string_view id, IResult result)
{
  std::string json = RpcErrorText(id, RpcError::tooLong, "Carried out, but what it returned is too long to be sent");
  json.resize(json.size() - 2);
  json += ",\"data\":";
  AppendCodeAndName(json, result);
  json += "}}}";
  return json;
}

std::string NotBegunText(std::string_view id)
{
  return RpcErrorText(id, RpcError::tooLong, "Not carried out: the responses to the calls before it are too long");
}

ResponseText SharedResultText(std::string_view id, ResponseText::Shared result)
{
  std::string head;
  AppendHead(head, id);
  ResponseText text(head + ",\"result\":");
  text.Append(std::move(result));
  text.Append("}");
  return text;
}

std::string SubscribedText(std::string_view id, IResult result, std::string_view epoch, std::uint64_t sequence)
{
  std::string json;
  AppendHead(json, id);
  json += ",\"result\":";
  AppendCodeAndName(json, result);
  json += ",\"outputs\":{},\"epoch\":";
  AppendString(json, epoch);
  json += ",\"sequence\":";
  AppendNumber(json, sequence);
  json += "}}";
  return json;
}

}
