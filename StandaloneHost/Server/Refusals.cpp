#include "StandaloneHost/Server/Refusals.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <algorithm>
#include <utility>

namespace Server
{

namespace
{

constexpr auto pause = std::chrono::seconds(10);

/// What a client sent, fit for a line of the log.
std::string Printable(std::string_view text)
{
  constexpr std::size_t longest = 120;
  std::string printable(text.substr(0, longest));
  std::replace_if(printable.begin(), printable.end(), [](char c) { return c < ' ' || c > '~'; }, '?');
  return printable;
}

std::string_view What(ERefusal kind)
{
  switch (kind)
  {
  case ERefusal::NoToken:
    return "without the right token";
  case ERefusal::WrongOrigin:
    return "by a web page of another origin";
  case ERefusal::WrongHost:
    return "under a name that is not this host's";
  case ERefusal::TooManyConnections:
    return "there are too many connections";
  case ERefusal::Displaced:
    return "idle, made room for another";
  case ERefusal::BadRequest:
    return "not a request that can be read";
  case ERefusal::BadHandshake:
    return "the handshake failed";
  case ERefusal::BrokenProtocol:
    return "broke the protocol or a limit";
  case ERefusal::SlowReader:
    return "reads too slowly";
  case ERefusal::Silent:
    return "does not answer pings";
  case ERefusal::Overdue:
    return "took too long";
  case ERefusal::NotAccepted:
    return "not accepted by the system";
  }
  return "";
}

}

Refusals::Refusals(Tell tell) : m_tell(std::move(tell))
{
  if (!m_tell)
    m_tell = [](const std::string& line) { NMX::Log(NMX::serverLog, NMX::ESeverity::Notice, "%1%", line); };
}

void Refusals::Note(ERefusal kind, std::string_view peer, std::string_view detail, Clock::time_point now)
{
  Kind& state = m_kinds[static_cast<std::size_t>(kind)];
  if (state.told && now - state.lastTold < pause)
  {
    ++state.heldBack;
    return;
  }
  std::string line = "Refused";
  if (!peer.empty())
    line.append(" ").append(peer);
  line.append(": ").append(What(kind));
  if (!detail.empty())
    line.append(": ").append(Printable(detail));
  if (state.heldBack != 0)
    line.append("; ").append(std::to_string(state.heldBack)).append(" more before");
  state = {now, 0, true};
  m_tell(line);
}

void Refusals::Tick(Clock::time_point now)
{
  for (std::size_t i = 0; i < kinds; ++i)
  {
    Kind& state = m_kinds[i];
    if (state.heldBack == 0 || now - state.lastTold < pause)
      continue;
    std::string line = "Refused ";
    line.append(std::to_string(state.heldBack)).append(" more: ").append(What(static_cast<ERefusal>(i)));
    state = {now, 0, true};
    m_tell(line);
  }
}

}
