#pragma once

#include "StandaloneHost/Server/Refusals.h"
#include "StandaloneHost/Server/VServer.h"

#include <ostream> // Beast's header of the status needs it, but does not include it

#include <boost/beast/http/status.hpp>

#include <string_view>

namespace Server
{

/// The parts of a request that decide whether it is let in.
struct Visitor
{
  std::string_view host;          ///< header Host
  std::string_view origin;        ///< header Origin; empty unless a web page asks
  std::string_view authorisation; ///< header Authorization
  std::string_view protocols{};   ///< header Sec-WebSocket-Protocol: a web page's WebSocket cannot set the other
  bool open = false;              ///< asks for what everybody may have, such as the page that asks for the token
};

enum class EAdmission
{
  Welcome,
  NoToken,     ///< a token is required and was not presented
  WrongOrigin, ///< a web page from elsewhere
  WrongHost    ///< a name that is not this machine's: a web page whose name was made to point here
};

/// How a visitor is turned away.
struct Refusal
{
  ERefusal kind;
  boost::beast::http::status status;
  std::string_view text; ///< for the visitor
};

/// For what is not welcome. [any]
[[nodiscard]] Refusal RefusalFor(EAdmission admission);

/// Decides whether a request is let in. Nothing of the request has been carried out yet. [any]
[[nodiscard]] EAdmission Admit(const Visitor& visitor, const ServerOptions& options);

/// The WebSocket protocol that is spoken here, whatever else a client offers.
inline constexpr std::string_view webSocketProtocol = "subject-store";

/// Whether a list of WebSocket protocols, separated by commas, has the one that is spoken here. [any]
[[nodiscard]] bool OffersProtocol(std::string_view protocols);

}
