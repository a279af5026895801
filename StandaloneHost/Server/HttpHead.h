#pragma once

#include <ostream> // Beast's header of the status needs it, but does not include it

#include <boost/beast/http/status.hpp>

#include <cstddef>
#include <string>
#include <string_view>

namespace Server
{

/// What stands above the body of an answer over HTTP.
struct HttpHead
{
  boost::beast::http::status status;
  std::string_view fields;    ///< of this answer alone, each with its line's end
  std::string_view type;      ///< of the body; empty for none
  std::string_view origin;    ///< of the web page that asks and that was admitted; empty for none
  bool keepAlive = true;      ///< the connection stays open for the next request
  bool askedAsHttp10 = false; ///< such a client is told when the connection stays open
};

/// The head's text, to which the body may be appended. It is worded by hand, in one piece: Beast's way of many small
/// buffers costs as much as carrying out a call. [any]
[[nodiscard]] std::string HeadText(const HttpHead& head, std::size_t bodyBytes, std::size_t reserved);

}
