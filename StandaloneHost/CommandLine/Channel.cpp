#include "StandaloneHost/CommandLine/Channel.h"

#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Layout.h"

#include <boost/asio/connect.hpp>
#include <boost/asio/ip/address.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/ssl/context.hpp>
#include <boost/beast/core/buffers_to_string.hpp>
#include <boost/beast/core/flat_buffer.hpp>
#include <boost/beast/http/field.hpp>
#include <boost/beast/http/string_body.hpp>
#include <boost/beast/ssl/ssl_stream.hpp>
#include <boost/beast/websocket.hpp>
#include <boost/beast/websocket/ssl.hpp>

#include <utility>
#include <vector>

namespace CommandLine
{

namespace
{

namespace asio = boost::asio;
namespace beast = boost::beast;
namespace http = boost::beast::http;
namespace websocket = boost::beast::websocket;
using asio::ip::tcp;
using boost::system::error_code;

constexpr std::size_t longestMessage = std::size_t{64} << 20;
constexpr auto closingTime = std::chrono::milliseconds(500);
constexpr auto silence = std::chrono::seconds(30); // without a word for that long, even to a ping, a host is lost

/// What a host said that does not let a client in, and what to do about it.
HostError Refusal(const http::response<http::string_body>& response, const Target& target)
{
  const auto status = response.result_int();
  std::string text = target.Url() + " refuses with HTTP status " + std::to_string(status);
  std::string body = response.body().substr(0, response.body().find_first_of("\r\n"));
  if (!body.empty())
    text += ": " + Quoted(body);
  if (status == 401)
    return HostError(text + "; --token-file FILE gives the token", true);
  if (status == 403)
    return HostError(text, true);
  if (status >= 300 && status < 400)
  {
    const auto location = response[http::field::location];
    return HostError(target.Url() + " redirects to " + Quoted({location.data(), location.size()}) +
                         ", which is not followed; --server names the host itself",
                     true);
  }
  if (status >= 500)
    return HostError(text + "; try again later");
  return HostError(text + "; is it a subject store host?", true);
}

/// One connection attempt's outcome so far, shared with handlers that may come after it was given up.
struct Outcome
{
  bool done = false;
  error_code error;
};

template <class Stream>
class WebSocketChannel final : public IChannel, public std::enable_shared_from_this<WebSocketChannel<Stream>>
{
public:
  template <class... Layers>
  WebSocketChannel(const Target& target, Loop& loop, Layers&&... layers)
      : m_target(target), m_loop(loop), m_stream(std::forward<Layers>(layers)...)
  {
  }

  websocket::stream<Stream>& Socket() { return m_stream; }

  /// Opens the TCP connection.
  void Open(Loop::Clock::time_point deadline)
  {
    const auto endpoints = Resolve(deadline);
    const error_code error =
        Await(deadline, [&](auto handler)
              { asio::async_connect(beast::get_lowest_layer(m_stream), endpoints, std::move(handler)); });
    if (error)
      throw HostError("cannot reach " + m_target.Url() + ": " + error.message() +
                      "; is a host running there? --server URL names another");
    beast::get_lowest_layer(m_stream).set_option(tcp::no_delay(true));
  }

  /// Asks for the WebSocket.
  void Upgrade(Loop::Clock::time_point deadline)
  {
    websocket::stream_base::timeout times{websocket::stream_base::none(), silence, true};
    m_stream.set_option(times);
    m_stream.read_message_max(longestMessage);
    m_stream.set_option(websocket::stream_base::decorator(
        [token = m_target.token](websocket::request_type& request)
        {
          if (!token.empty())
            request.set(http::field::authorization, "Bearer " + token);
        }));
    const auto response = std::make_shared<http::response<http::string_body>>();
    const std::string name = m_target.HostAndPort();
    const error_code error =
        Await(deadline,
              [&](auto handler)
              {
                m_stream.async_handshake(*response, name, "/rpc",
                                         [response, handler = std::move(handler)](error_code result) mutable
                                         { handler(result); });
              });
    if (error == websocket::error::upgrade_declined)
      throw Refusal(*response, m_target);
    if (error)
      throw HostError(m_target.Url() + " does not answer like a subject store host: " + error.message() +
                      (m_target.tls ? "" : "; is it https:// perhaps?"));
  }

  /// Waits for the operation that `start` begins with a handler. Throws HostError when the time is up.
  template <class Start>
  error_code Await(Loop::Clock::time_point deadline, Start start)
  {
    const auto outcome = std::make_shared<Outcome>();
    start(
        [self = this->shared_from_this(), outcome](error_code error, auto&&...)
        {
          outcome->done = true;
          outcome->error = error;
        });
    if (!m_loop.RunUntil([&] { return outcome->done; }, deadline))
    {
      Abort();
      throw HostError(m_target.Url() + " does not answer in time");
    }
    return outcome->error;
  }

  void Send(const std::string& message) override
  {
    const auto text = std::make_shared<const std::string>(message);
    const error_code error =
        Await(Loop::Clock::now() + m_target.timeout,
              [&](auto handler)
              {
                m_stream.async_write(asio::buffer(*text),
                                     [text, handler = std::move(handler)](error_code result, std::size_t) mutable
                                     { handler(result); });
              });
    if (error)
      throw Lost(error);
  }

  std::optional<std::string> Receive(Loop::Clock::time_point deadline) override
  {
    if (!m_reading)
    {
      m_reading = true;
      m_arrived = false;
      m_stream.async_read(m_buffer,
                          [self = this->shared_from_this()](error_code error, std::size_t)
                          {
                            self->m_arrived = true;
                            self->m_error = error;
                          });
    }
    if (!m_loop.RunUntil([this] { return m_arrived; }, deadline))
      return std::nullopt;
    if (m_error)
      throw Lost(m_error);
    m_reading = false;
    std::string message = beast::buffers_to_string(m_buffer.cdata());
    m_buffer.clear();
    return message;
  }

  void Close() override
  {
    const auto outcome = std::make_shared<Outcome>();
    m_stream.async_close(websocket::close_code::normal,
                         [self = this->shared_from_this(), outcome](error_code) { outcome->done = true; });
    m_loop.Finish([&] { return outcome->done; }, Loop::Clock::now() + closingTime);
    Abort();
  }

private:
  std::vector<tcp::endpoint> Resolve(Loop::Clock::time_point deadline)
  {
    error_code error;
    const auto address = asio::ip::make_address(m_target.host, error);
    if (!error)
      return {{address, static_cast<unsigned short>(std::stoi(m_target.port))}};
    // The resolver and what it finds are shared with the handler: they may be given up while a name server is asked.
    struct Search
    {
      tcp::resolver resolver;
      std::vector<tcp::endpoint> found;
    };
    const auto search = std::make_shared<Search>(Search{tcp::resolver(m_loop.Context()), {}});
    error = Await(deadline,
                  [&](auto handler)
                  {
                    search->resolver.async_resolve(
                        m_target.host, m_target.port,
                        [search, handler = std::move(handler)](error_code result, const auto& entries) mutable
                        {
                          for (const auto& entry : entries)
                            search->found.push_back(entry.endpoint());
                          handler(result);
                        });
                  });
    if (error)
      throw HostError("cannot reach " + m_target.Url() + ": " + error.message() + "; --server URL names the host");
    return search->found;
  }

  HostError Lost(error_code error)
  {
    const std::string start = "the connection to " + m_target.Url() + " is lost: ";
    if (error == websocket::error::closed && !m_stream.reason().reason.empty())
      return HostError(start +
                       Visible(std::string_view(m_stream.reason().reason.data(), m_stream.reason().reason.size())));
    if (error == websocket::error::closed)
      return HostError(start + "the host has closed it");
    if (error == asio::error::eof || error == beast::error::timeout)
      return HostError(start + "the host has gone");
    if (error == websocket::error::message_too_big || error == websocket::error::buffer_overflow)
      return HostError(start + "a message of the host is longer than " + std::to_string(longestMessage) + " bytes");
    return HostError(start + error.message());
  }

  void Abort()
  {
    error_code ignored;
    beast::get_lowest_layer(m_stream).close(ignored);
  }

  const Target m_target;
  Loop& m_loop;
  websocket::stream<Stream> m_stream;
  beast::flat_buffer m_buffer{longestMessage + 1};
  bool m_reading = false;
  bool m_arrived = false;
  error_code m_error;
};

using PlainChannel = WebSocketChannel<tcp::socket>;
using SecureChannel = WebSocketChannel<beast::ssl_stream<tcp::socket>>;

asio::ssl::context MakeTlsContext(const Target& target)
{
  asio::ssl::context context(asio::ssl::context::tls_client);
  SSL_CTX_set_min_proto_version(context.native_handle(), TLS1_2_VERSION);
  // A certificate that the user names is trusted as it stands, whoever signed it.
  X509_VERIFY_PARAM_set_flags(SSL_CTX_get0_param(context.native_handle()), X509_V_FLAG_PARTIAL_CHAIN);
  context.set_verify_mode(asio::ssl::verify_peer);
  error_code error;
  if (target.authority.empty())
    context.set_default_verify_paths(error);
  else
    context.load_verify_file(target.authority, error);
  if (error)
    throw UsageError("--tls-ca: cannot read certificates from " + Quoted(target.authority) + ": " + error.message());
  return context;
}

/// Has the certificate checked for the host's name or address, and tells the host which name is meant.
void ExpectHost(SSL* connection, const Target& target)
{
  error_code notAnAddress;
  (void)asio::ip::make_address(target.host, notAnAddress);
  X509_VERIFY_PARAM* const parameters = SSL_get0_param(connection);
  const bool done = notAnAddress ? SSL_set_tlsext_host_name(connection, target.host.c_str()) == 1 &&
                                       X509_VERIFY_PARAM_set1_host(parameters, target.host.c_str(), 0) == 1
                                 : X509_VERIFY_PARAM_set1_ip_asc(parameters, target.host.c_str()) == 1;
  if (!done)
    throw UsageError("--server: a certificate cannot be for " + Quoted(target.host));
}

/// Speaks TLS and checks that the host is who it is taken for.
void Secure(SecureChannel& channel, const Target& target, Loop::Clock::time_point deadline)
{
  auto& stream = channel.Socket().next_layer();
  ExpectHost(stream.native_handle(), target);
  const error_code error = channel.Await(
      deadline, [&](auto handler) { stream.async_handshake(asio::ssl::stream_base::client, std::move(handler)); });
  if (!error)
    return;
  const long verified = SSL_get_verify_result(stream.native_handle());
  if (verified == X509_V_ERR_HOSTNAME_MISMATCH || verified == X509_V_ERR_IP_ADDRESS_MISMATCH)
    throw HostError("the certificate of " + target.Url() + " is for another host", true);
  if (verified != X509_V_OK)
    throw HostError("the certificate of " + target.Url() + " is not trusted (" +
                        X509_verify_cert_error_string(verified) +
                        "); --tls-ca FILE names the authority or the certificate to trust",
                    true);
  throw HostError(target.Url() + " does not answer in TLS: " + error.message() + "; is it http:// perhaps?");
}

}

std::shared_ptr<IChannel> Connect(const Target& target, Loop& loop)
{
  const auto deadline = Loop::Clock::now() + target.timeout;
  if (!target.tls)
  {
    const auto channel = std::make_shared<PlainChannel>(target, loop, loop.Context());
    channel->Open(deadline);
    channel->Upgrade(deadline);
    return channel;
  }
  asio::ssl::context context = MakeTlsContext(target);
  const auto channel = std::make_shared<SecureChannel>(target, loop, loop.Context(), context);
  channel->Open(deadline);
  Secure(*channel, target, deadline);
  channel->Upgrade(deadline);
  return channel;
}

}
