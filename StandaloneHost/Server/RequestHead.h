#pragma once

#include <boost/beast/http/fields.hpp>
#include <boost/beast/http/message.hpp>

#include <optional>
#include <string>
#include <string_view>

namespace Server
{

/// What the head of an HTTP request says, where there is only one way to read it. The views look into the request.
struct RequestHead
{
  boost::beast::http::verb method = boost::beast::http::verb::unknown;
  std::string_view path; ///< without the query; "*" for a question about the whole server
  std::string_view host; ///< with the port, if there is one; empty when HTTP/1.0 names none
  std::string_view origin;
  std::string_view authorisation;
  std::string webSocketProtocols;
  bool hasBody = false;
  bool awaitsContinue = false; ///< the client sends the body once it is told to
};

/// Why a head is refused.
struct HeadError
{
  boost::beast::http::status status;
  std::string_view text; ///< for people; ends with a line break
};

/// Reads a head. What two readers could read differently is refused, so that nothing that stands between a client and
/// the server takes another request for granted: more than one length, more than one host, a coding that is not known,
/// a body where there is none. [any]
[[nodiscard]] std::optional<HeadError> ReadHead(const boost::beast::http::request_header<>& request, RequestHead& head);

}
