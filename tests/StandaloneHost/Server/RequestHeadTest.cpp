#include "StandaloneHost/Server/RequestHead.h"

#include <boost/asio/buffer.hpp>
#include <boost/beast/http/empty_body.hpp>
#include <boost/beast/http/parser.hpp>
#include <gtest/gtest.h>

namespace http = boost::beast::http;

namespace
{

constexpr std::string_view host = "Host: stage:1\r\n";

/// What a head comes to: "METHOD path host" with "+body" and "+continue", or the status with which it is refused; 0
/// when the parser does not take it in the first place.
std::string Outcome(std::string_view line, std::string_view fields)
{
  const std::string text = std::string(line) + "\r\n" + std::string(fields) + "\r\n";
  http::request_parser<http::empty_body> parser;
  boost::system::error_code error;
  (void)parser.put(boost::asio::buffer(text), error);
  if (error)
    return "0";
  Server::RequestHead head;
  if (const auto refused = Server::ReadHead(parser.get().base(), head))
    return std::to_string(static_cast<unsigned>(refused->status));
  std::string outcome(http::to_string(head.method));
  outcome.append(" ").append(head.path).append(" ").append(head.host);
  return outcome + (head.hasBody ? " +body" : "") + (head.awaitsContinue ? " +continue" : "");
}

}

TEST(RequestHead, IsReadInOneWayOrRefused)
{
  const std::string one(host);
  const struct
  {
    std::string line;
    std::string fields;
    std::string outcome;
  } cases[] = {
      {"GET / HTTP/1.1", one, "GET / stage:1"},
      {"GET /?x=1 HTTP/1.1", one, "GET / stage:1"},
      {"GET /a/b?x=/y HTTP/1.1", one, "GET /a/b stage:1"},
      {"GET http://other:2/a?b HTTP/1.1", one, "GET /a other:2"},
      {"GET HTTPS://[::1] HTTP/1.1", one, "GET / [::1]"},
      {"GET http://other?x HTTP/1.1", one, "GET / other"},
      {"GET http:///a HTTP/1.1", one, "400"},
      {"GET http://user@other/ HTTP/1.1", one, "400"},
      {"GET ftp://other/ HTTP/1.1", one, "400"},
      {"GET a HTTP/1.1", one, "400"},
      {"GET /#a HTTP/1.1", one, "400"},
      {"OPTIONS * HTTP/1.1", one, "OPTIONS * stage:1"},
      {"GET * HTTP/1.1", one, "400"},
      {"CONNECT stage:1 HTTP/1.1", one, "400"},
      {"GET / HTTP/2.0", one, "0"},
      {"GET / HTTP/1.1", "", "400"},
      {"GET / HTTP/1.0", "", "GET / "},
      {"GET / HTTP/1.0", one + one, "400"},
      {"GET / HTTP/1.1", one + one, "400"},
      {"GET / HTTP/1.1", one + "Host: other\r\n", "400"},
      {"GET / HTTP/1.1", "Host: a b\r\n", "400"},
      {"GET / HTTP/1.1", "Host: a,b\r\n", "400"},
      {"GET / HTTP/1.1", "Host: a/b\r\n", "400"},
      {"POST /rpc HTTP/1.1", one + "Content-Length: 0\r\n", "POST /rpc stage:1"},
      {"POST /rpc HTTP/1.1", one + "Content-Length: 5\r\n", "POST /rpc stage:1 +body"},
      {"POST /rpc HTTP/1.1", one + "Transfer-Encoding: Chunked\r\n", "POST /rpc stage:1 +body"},
      {"POST /rpc HTTP/1.1", one + "Transfer-Encoding: gzip\r\n", "501"},
      {"POST /rpc HTTP/1.1", one + "Transfer-Encoding: gzip, chunked\r\n", "501"},
      {"POST /rpc HTTP/1.1", one + "Transfer-Encoding: \r\n", "501"},
      {"POST /rpc HTTP/1.0", one + "Transfer-Encoding: chunked\r\n", "400"},
      {"GET / HTTP/1.1", one + "Content-Length: 5\r\n", "400"},
      {"GET / HTTP/1.1", one + "Content-Length: 00\r\n", "GET / stage:1"},
      {"HEAD / HTTP/1.1", one + "Transfer-Encoding: chunked\r\n", "400"},
      {"OPTIONS * HTTP/1.1", one + "Transfer-Encoding: chunked\r\n", "400"},
      {"POST /rpc HTTP/1.1", one + "Expect: 100-Continue\r\nContent-Length: 5\r\n",
       "POST /rpc stage:1 +body +continue"},
      {"POST /rpc HTTP/1.1", one + "Expect: 100-continue\r\n", "POST /rpc stage:1"},
      {"POST /rpc HTTP/1.1", one + "Expect: miracles\r\n", "417"},
      {"POST /rpc HTTP/1.0", one + "Expect: miracles\r\n", "POST /rpc stage:1"},
      {"GET / HTTP/1.1", one + "Authorization: a\r\nauthorization: b\r\n", "400"},
      {"GET / HTTP/1.1", one + "Origin: a\r\nOrigin: a\r\n", "400"},
  };
  for (const auto& c : cases)
    EXPECT_EQ(Outcome(c.line, c.fields), c.outcome) << c.line << "\n" << c.fields;
}

TEST(RequestHead, TellsOneLengthOnly)
{
  for (const std::string lengths :
       {"Content-Length: 5\r\nContent-Length: 5\r\n", "Content-Length: 5\r\nContent-Length: 6\r\n",
        "Content-Length: 5, 5\r\n", "Content-Length: +5\r\n", "Content-Length: -0\r\n", "Content-Length: 0x5\r\n",
        "Content-Length: \r\n", "Transfer-Encoding: x, chunked, x\r\n",
        "Content-Length: 5\r\nTransfer-Encoding: chunked\r\n", "Transfer-Encoding: chunked\r\nContent-Length: 5\r\n",
        "Transfer-Encoding: chunked\r\nTransfer-Encoding: chunked\r\n"})
  {
    const std::string outcome = Outcome("POST /rpc HTTP/1.1", std::string(host) + lengths);
    EXPECT_TRUE(outcome == "0" || outcome == "400" || outcome == "501") << lengths << outcome;
  }
}
