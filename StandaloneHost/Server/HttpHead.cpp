#include "StandaloneHost/Server/HttpHead.h"

namespace Server
{

namespace
{

constexpr std::size_t ordinaryBytes = 1024;

/// A page may load nothing from elsewhere, and stand in no other page.
constexpr std::string_view pageFields =
    "Content-Security-Policy: default-src 'none'; script-src 'self'; style-src 'self'; connect-src 'self'; "
    "img-src 'self' data:; base-uri 'none'; form-action 'none'; frame-ancestors 'none'\r\n"
    "Referrer-Policy: no-referrer\r\n";

}

std::string HeadText(const HttpHead& head, std::size_t bodyBytes, std::size_t reserved)
{
  const auto reason = boost::beast::http::obsolete_reason(head.status);
  std::string text;
  text.reserve(ordinaryBytes + reserved);
  text.append("HTTP/1.1 ").append(std::to_string(static_cast<unsigned>(head.status))).append(" ");
  text.append(reason.data(), reason.size()).append("\r\n").append(head.fields);
  const auto field = [&text](std::string_view name, std::string_view value)
  { text.append(name).append(": ").append(value).append("\r\n"); };
  if (!head.type.empty())
    field("Content-Type", head.type);
  field("X-Content-Type-Options", "nosniff");
  field("Cache-Control", "no-store");
  if (head.type.starts_with("text/html"))
    text += pageFields;
  if (!head.origin.empty())
  {
    field("Access-Control-Allow-Origin", head.origin);
    field("Access-Control-Allow-Headers", "Authorization, Content-Type");
    field("Access-Control-Allow-Methods", "GET, POST");
    field("Vary", "Origin");
  }
  if (!head.keepAlive || head.askedAsHttp10)
    field("Connection", head.keepAlive ? "keep-alive" : "close");
  if (head.status != boost::beast::http::status::no_content)
    field("Content-Length", std::to_string(bodyBytes));
  return text += "\r\n";
}

}
