#pragma once

#include "StandaloneHost/Server/Limits.h"

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Server
{

/// Error codes of JSON-RPC 2.0.
namespace RpcError
{
inline constexpr int parse = -32700;
inline constexpr int invalidRequest = -32600;
inline constexpr int methodNotFound = -32601;
inline constexpr int invalidParams = -32602;
inline constexpr int tooLong = -32000; ///< of the server's own: what is to be answered is too long
}

/// What is wrong with a message or one of its requests.
struct Complaint
{
  int code;
  std::string text;
};

/// One request of a message. The views look into the message.
struct Request
{
  std::string method;
  std::string_view params = "[]";     ///< raw JSON, an array or an object
  std::string_view id;                ///< raw JSON; empty: a notification, which is not answered
  std::optional<Complaint> complaint; ///< set when it is no request; the id is "null" unless it was readable
};

/// A message from a client, taken apart and checked in full before any of it is carried out.
struct Message
{
  bool batch = false;
  std::vector<Request> requests;
  std::optional<Complaint> complaint; ///< set when the message as a whole is refused
};

/// Reads a request or a batch. Never throws for anything a client can send.
[[nodiscard]] Message ReadMessage(std::string_view text, const Limits& limits);

/// Members of an object, each with its raw value, in the order of the text.
using Members = std::vector<std::pair<std::string, std::string_view>>;

/// The members of a raw JSON object that ReadMessage has accepted.
[[nodiscard]] Members ReadMembers(std::string_view object, const Limits& limits);

/// The elements of a raw JSON array of texts; nothing when it is anything else.
[[nodiscard]] std::optional<std::vector<std::string>> ReadTexts(std::string_view array);

}
