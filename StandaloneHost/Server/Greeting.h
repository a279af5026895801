#pragma once

#include "HostInterface/TerminalServer2/IServer.h"
#include "StandaloneHost/Server/Limits.h"

#include <boost/json/fwd.hpp>

#include <cstdint>
#include <string>
#include <string_view>

namespace Server
{

/// What the server says first to a client that can be told of changes.
struct Greeting
{
  std::uint64_t session;
  std::string_view epoch;
  std::string_view api; ///< hash of the documents that describe the API
  const Limits& limits;
  TerminalServer2::Level grantedLevel;
};

inline constexpr std::string_view greetingMethod = "Server.Hello";

/// The greeting as a JSON-RPC notification.
[[nodiscard]] std::string GreetingText(const Greeting& greeting);

/// The members of the greeting's parameters, each with its schema.
[[nodiscard]] boost::json::object GreetingMembers();

}
