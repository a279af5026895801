#include "StandaloneHost/Server/RequestHead.h"

#include <boost/beast/core/string.hpp>

#include <algorithm>

namespace Server
{

namespace http = boost::beast::http;
using Request = http::request_header<>;
using Error = std::optional<HeadError>;

namespace
{

Error Bad(std::string_view text)
{
  return HeadError{http::status::bad_request, text};
}

std::string_view ToView(boost::beast::string_view text)
{
  return {text.data(), text.size()};
}

bool SameText(std::string_view a, std::string_view b)
{
  return boost::beast::iequals({a.data(), a.size()}, {b.data(), b.size()});
}

constexpr std::string_view elsewhere = "/\\?#@,\"<>"; // characters that have another meaning elsewhere

/// "name", "name:port", "address:port" or "[address]:port", as far as it can be read in one way only.
bool IsHost(std::string_view host)
{
  return std::none_of(host.begin(), host.end(),
                      [](char c) { return c <= ' ' || c > '~' || elsewhere.find(c) != elsewhere.npos; });
}

/// Where a request goes, in one of the three forms that there are for it.
Error ReadTarget(std::string_view target, RequestHead& head)
{
  if (target.find('#') != target.npos)
    return Bad("The target has a fragment.\n");
  const auto withoutQuery = [](std::string_view path) { return path.substr(0, path.find('?')); };
  if (target == "*" && head.method == http::verb::options)
    head.path = target;
  else if (target.starts_with('/'))
    head.path = withoutQuery(target);
  else
  {
    const std::size_t colon = target.find("://");
    if (colon == target.npos ||
        !(SameText(target.substr(0, colon), "http") || SameText(target.substr(0, colon), "https")))
      return Bad("The target is neither a path nor an address.\n");
    // The address counts, whatever the header Host says.
    const std::string_view rest = target.substr(colon + 3);
    head.host = rest.substr(0, rest.find_first_of("/?"));
    if (head.host.empty() || !IsHost(head.host))
      return Bad("The target's address cannot be read.\n");
    const std::string_view path = withoutQuery(rest.substr(head.host.size()));
    head.path = path.empty() ? std::string_view("/") : path;
  }
  return {};
}

Error ReadHost(const Request& request, RequestHead& head)
{
  const auto count = request.count(http::field::host);
  if (count > 1 || (count == 0 && request.version() >= 11))
    return Bad("A request has one header Host.\n");
  head.host = ToView(request[http::field::host]);
  return IsHost(head.host) ? Error{} : Bad("The header Host cannot be read.\n");
}

/// How much follows the head.
Error ReadFraming(const Request& request, RequestHead& head)
{
  const auto codings = request.count(http::field::transfer_encoding);
  const auto lengths = request.count(http::field::content_length);
  if (lengths > 1 || (lengths != 0 && codings != 0))
    return Bad("The length of the body is told more than once.\n");
  if (codings != 0 && request.version() < 11)
    return Bad("HTTP/1.0 has no Transfer-Encoding.\n");
  if (codings > 1 || (codings == 1 && !SameText(ToView(request[http::field::transfer_encoding]), "chunked")))
    return HeadError{http::status::not_implemented, "The only Transfer-Encoding is chunked.\n"};
  const std::string_view length = ToView(request[http::field::content_length]);
  if (length.find_first_not_of("0123456789") != length.npos)
    return Bad("The header Content-Length is not a number.\n");
  head.hasBody = codings != 0 || length.find_first_not_of('0') != length.npos;
  if (head.hasBody &&
      (head.method == http::verb::get || head.method == http::verb::head || head.method == http::verb::options))
    return Bad("GET, HEAD and OPTIONS have no body.\n");
  return {};
}

Error ReadExpectation(const Request& request, RequestHead& head)
{
  const auto expected = request.find(http::field::expect);
  if (expected == request.end() || request.version() < 11)
    return {};
  if (request.count(http::field::expect) > 1 || !SameText(ToView(expected->value()), "100-continue"))
    return HeadError{http::status::expectation_failed, "Nothing is to be expected but 100-continue.\n"};
  head.awaitsContinue = head.hasBody;
  return {};
}

/// A page's token may stand in one of several lines.
std::string Joined(const Request& request, http::field name)
{
  std::string all;
  const auto [first, last] = request.equal_range(name);
  for (auto field = first; field != last; ++field)
    all.append(all.empty() ? "" : ",").append(ToView(field->value()));
  return all;
}

/// Headers that decide something, and that have one value.
constexpr http::field single[] = {http::field::authorization, http::field::origin, http::field::sec_websocket_key,
                                  http::field::sec_websocket_version};

}

Error ReadHead(const Request& request, RequestHead& head)
{
  head.method = request.method();
  for (const http::field name : single)
    if (request.count(name) > 1)
      return Bad("A header that has one value is there twice.\n");
  if (const Error error = ReadHost(request, head))
    return error;
  if (const Error error = ReadTarget(ToView(request.target()), head))
    return error;
  if (const Error error = ReadFraming(request, head))
    return error;
  head.origin = ToView(request[http::field::origin]);
  head.authorisation = ToView(request[http::field::authorization]);
  head.webSocketProtocols = Joined(request, http::field::sec_websocket_protocol);
  return ReadExpectation(request, head);
}

}
