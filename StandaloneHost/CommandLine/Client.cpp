#include "StandaloneHost/CommandLine/Client.h"

#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/Server/Envelope.h"

#include <boost/json.hpp>

#include <algorithm>
#include <charconv>

namespace CommandLine
{

namespace json = boost::json;

namespace
{

/// More than a host sends during a call; without an end, they would fill the memory.
constexpr std::size_t mostNotifications = 10000;

/// Line breaks between the tokens of a JSON text become spaces; in strings there are none.
std::string InOneLine(std::string text)
{
  std::replace_if(text.begin(), text.end(), [](char c) { return c == '\n' || c == '\r'; }, ' ');
  return text;
}

}

RawMembers ReadObject(std::string_view text)
{
  json::error_code error;
  const json::value value = json::parse(json::string_view(text.data(), text.size()), error);
  if (error)
    throw HostError("the host's answer is not JSON: " + error.message());
  if (!value.is_object())
    throw HostError("the host's answer is not as expected: " + Quoted(text.substr(0, 100)));
  // That it is JSON is known: each member's own text can be taken out.
  RawMembers members;
  Server::Limits limits;
  limits.nesting *= 2;
  for (const auto& [name, raw] : Server::ReadMembers(text.substr(text.find('{')), limits))
    members.emplace_back(name, raw);
  return members;
}

std::string Member(const RawMembers& members, std::string_view name)
{
  const auto found =
      std::find_if(members.begin(), members.end(), [name](const auto& member) { return member.first == name; });
  return found == members.end() ? std::string{} : found->second;
}

std::string TextOf(std::string_view text)
{
  json::error_code error;
  const json::value value = json::parse(json::string_view(text.data(), text.size()), error);
  return error || !value.is_string() ? std::string{} : std::string(value.get_string());
}

std::optional<std::uint64_t> NumberOf(std::string_view text)
{
  std::uint64_t number = 0;
  const auto read = std::from_chars(text.data(), text.data() + text.size(), number);
  if (read.ec != std::errc{} || read.ptr != text.data() + text.size())
    return std::nullopt;
  return number;
}

std::string JsonString(std::string_view text)
{
  return json::serialize(json::string(text.data(), text.size()));
}

Client::Client(Target target, Loop& loop) : m_target(std::move(target)), m_channel(Connect(m_target, loop))
{
  Greet();
}

Client::~Client()
{
  m_channel->Close();
}

void Client::Greet()
{
  const auto text = m_channel->Receive(Loop::Clock::now() + m_target.timeout);
  if (!text)
    throw HostError(m_target.Url() + " does not answer in time");
  const RawMembers message = ReadMessage(*text);
  if (TextOf(Member(message, "method")) != "Server.Hello")
    throw HostError(m_target.Url() + " does not greet like a subject store host");
  m_epoch = TextOf(Member(ReadMessage(Member(message, "params")), "epoch"));
  if (m_epoch.empty())
    throw HostError(m_target.Url() + " does not say its epoch");
}

RawMembers Client::ReadMessage(const std::string& text) const
{
  try
  {
    return ReadObject(text);
  }
  catch (const HostError& failure)
  {
    throw HostError(m_target.Url() + " does not speak like a subject store host: " + failure.what());
  }
}

void Client::Keep(const RawMembers& message)
{
  std::string params = Member(message, "params");
  if (!params.starts_with('{'))
    params = "{}";
  if (m_notifications.size() == mostNotifications)
    throw HostError(m_target.Url() + " sends notifications instead of an answer");
  m_notifications.push_back({TextOf(Member(message, "method")), InOneLine(std::move(params))});
}

Answer Client::Call(const std::string& method, const std::string& params)
{
  const std::string id = std::to_string(++m_lastId);
  m_channel->Send(R"({"jsonrpc":"2.0","id":)" + id + R"(,"method":)" + JsonString(method) + R"(,"params":)" + params +
                  '}');
  const auto deadline = Loop::Clock::now() + m_target.timeout;
  for (;;)
  {
    const auto text = m_channel->Receive(deadline);
    if (!text)
      throw HostError(m_target.Url() + " does not answer in time; --timeout SECONDS gives it more");
    const RawMembers message = ReadMessage(*text);
    if (!Member(message, "method").empty())
    {
      Keep(message);
      continue;
    }
    std::string result = Member(message, "result");
    std::string error = Member(message, "error");
    const std::string answered = Member(message, "id");
    // A message that the host could not read is answered without an id.
    const bool ours = answered == id || (answered == "null" && !error.empty());
    if (!ours || result.empty() == error.empty())
      throw HostError(m_target.Url() + " sends what is not an answer: " + Quoted(*text));
    return {!error.empty(), InOneLine(std::move(result) + std::move(error))};
  }
}

std::optional<Notification> Client::Next(std::chrono::milliseconds time)
{
  const auto deadline = Loop::Clock::now() + time;
  while (m_notifications.empty())
  {
    const auto text = m_channel->Receive(deadline);
    if (!text)
      return std::nullopt;
    const RawMembers message = ReadMessage(*text);
    if (Member(message, "method").empty())
      throw HostError(m_target.Url() + " sends what is not a notification: " + Quoted(*text));
    Keep(message);
  }
  Notification next = std::move(m_notifications.front());
  m_notifications.pop_front();
  return next;
}

}
