#include "StandaloneHost/Server/HttpSession.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Server/Admission.h"
#include "StandaloneHost/Server/WebSocketSession.h"

#include <boost/asio/write.hpp>
#include <boost/beast/core/flat_buffer.hpp>
#include <boost/beast/http.hpp>
#include <boost/beast/websocket/rfc6455.hpp>

#include <optional>
#include <utility>

namespace Server
{

namespace http = boost::beast::http;
using boost::system::error_code;
using Socket = boost::asio::basic_stream_socket<boost::asio::ip::tcp, boost::asio::io_context::executor_type>;
using Clock = std::chrono::steady_clock;

namespace
{

constexpr std::size_t headerBytes = 16384;
constexpr auto idleTime = std::chrono::seconds(60);
constexpr auto transferTime = std::chrono::seconds(30);
constexpr auto closingTime = std::chrono::seconds(2);

/// What a refused visitor is told.
std::pair<http::status, std::string_view> Refusal(EAdmission admission)
{
  switch (admission)
  {
  case EAdmission::NoToken:
    return {http::status::unauthorized, "The token is missing or wrong: send \"Authorization: Bearer TOKEN\".\n"};
  case EAdmission::WrongOrigin:
    return {http::status::forbidden, "Web pages of this origin may not connect; the host allows them with "
                                     "--allow-origin.\n"};
  case EAdmission::WrongHost:
    return {http::status::forbidden, "This host is reached by its address or as localhost, not by that name.\n"};
  case EAdmission::Welcome:
    break;
  }
  return {http::status::ok, ""};
}

std::string_view ToView(boost::beast::string_view text)
{
  return {text.data(), text.size()};
}

class HttpSession final : public IConnection, public std::enable_shared_from_this<HttpSession>
{
public:
  HttpSession(Socket socket, std::shared_ptr<Core> core) : m_core(std::move(core)), m_socket(std::move(socket))
  {
    m_core->connections.Add(*this);
  }

  ~HttpSession() { m_core->connections.Remove(*this); }

  /// Waits for the next request.
  void Read()
  {
    m_busy = false;
    m_parser.emplace();
    m_parser->header_limit(headerBytes);
    m_parser->body_limit(m_core->options.limits.messageBytes);
    m_deadline = Clock::now() + idleTime;
    http::async_read_header(m_socket, m_buffer, *m_parser,
                            [self = shared_from_this()](error_code error, std::size_t) { self->OnHeader(error); });
  }

  void RespondAndClose(http::status status, std::string_view text)
  {
    m_keepAlive = false;
    Respond(status, "text/plain; charset=utf-8", std::string(text));
  }

  void Close() override
  {
    m_keepAlive = false;
    if (!m_busy)
      Abort();
  }

  void Abort() override
  {
    error_code ignored;
    m_socket.close(ignored);
  }

  [[nodiscard]] bool Overdue(Clock::time_point now) const override { return now > m_deadline; }

  [[nodiscard]] std::weak_ptr<IConnection> Weak() override { return weak_from_this(); }

private:
  void OnHeader(error_code error)
  {
    m_busy = true;
    m_deadline = Clock::now() + transferTime;
    if (error)
      return OnBadRequest(error);

    const auto& request = m_parser->get();
    m_keepAlive = request.keep_alive() && !m_core->closing;
    m_origin = request[http::field::origin];
    const EAdmission admission =
        Admit({ToView(request[http::field::host]), m_origin, ToView(request[http::field::authorization]),
               request.method() == http::verb::options},
              m_core->options);
    if (admission != EAdmission::Welcome)
    {
      m_origin.clear();
      const auto [status, text] = Refusal(admission);
      NMX::Log(NMX::serverLog, NMX::ESeverity::Info, "A request was refused: %1%",
               text.substr(0, text.empty() ? 0 : text.size() - 1));
      return RespondAndClose(status, text);
    }
    if (boost::beast::websocket::is_upgrade(request))
    {
      if (request.target() != "/rpc")
        return RespondAndClose(http::status::not_found, "WebSockets are served at /rpc.\n");
      return StartWebSocket(std::move(m_socket), http::request<http::string_body>(request.base()), m_core);
    }
    if (request[http::field::expect] == "100-continue")
      return SendContinue();
    ReadBody();
  }

  void SendContinue()
  {
    static constexpr std::string_view text = "HTTP/1.1 100 Continue\r\n\r\n";
    boost::asio::async_write(m_socket, boost::asio::buffer(text),
                             [self = shared_from_this()](error_code error, std::size_t)
                             {
                               if (!error)
                                 self->ReadBody();
                             });
  }

  void ReadBody()
  {
    http::async_read(m_socket, m_buffer, *m_parser,
                     [self = shared_from_this()](error_code error, std::size_t)
                     {
                       if (error)
                         self->OnBadRequest(error);
                       else
                         self->OnRequest();
                     });
  }

  void OnBadRequest(error_code error)
  {
    if (error == http::error::body_limit)
      RespondAndClose(http::status::payload_too_large, "The message is longer than " +
                                                           std::to_string(m_core->options.limits.messageBytes) +
                                                           " bytes.\n");
    else if (error == http::error::header_limit)
      RespondAndClose(http::status::request_header_fields_too_large, "The header is too long.\n");
    else if (error == http::error::end_of_stream || error == http::error::partial_message ||
             error.category() != make_error_code(http::error::end_of_stream).category())
      Abort(); // the client has gone
    else
      RespondAndClose(http::status::bad_request, "Not an HTTP request: " + error.message() + ".\n");
  }

  void OnRequest()
  {
    const auto& request = m_parser->get();
    const std::string_view target = ToView(request.target());
    const http::verb method = request.method();
    if (method == http::verb::options)
      return Respond(http::status::no_content, {}, {});
    if (target == "/rpc")
    {
      if (method == http::verb::post)
        return Call();
      return RespondWithAllow("POST, OPTIONS", "Calls are posted; a GET needs a WebSocket upgrade.\n");
    }
    const Document* document = m_core->documents.Find(target);
    if (document == nullptr)
      return Respond(http::status::not_found, "text/plain; charset=utf-8", "There is nothing here.\n");
    if (method != http::verb::get)
      return RespondWithAllow("GET, OPTIONS", "This can only be read.\n");
    Respond(http::status::ok, document->type, document->text);
  }

  void Call()
  {
    try
    {
      // No notifications without a WebSocket. The body stays until the next request is read.
      m_core->dispatcher.Handle(m_parser->get().body(), nullptr,
                                [self = shared_from_this()](std::string answer, std::size_t)
                                {
                                  if (answer.empty())
                                    self->Respond(http::status::no_content, {}, {});
                                  else
                                    self->Respond(http::status::ok, "application/json", std::move(answer));
                                });
    }
    catch (const std::exception& failure)
    {
      NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "A message could not be handled: %1%", failure.what());
      RespondAndClose(http::status::internal_server_error, "The message could not be handled.\n");
    }
  }

  void RespondWithAllow(std::string_view methods, std::string_view text)
  {
    m_response = {};
    m_response.set(http::field::allow, boost::beast::string_view(methods.data(), methods.size()));
    Send(http::status::method_not_allowed, "text/plain; charset=utf-8", std::string(text));
  }

  void Respond(http::status status, std::string_view type, std::string body)
  {
    m_response = {};
    if (status == http::status::unauthorized)
      m_response.set(http::field::www_authenticate, "Bearer");
    Send(status, type, std::move(body));
  }

  void Send(http::status status, std::string_view type, std::string body)
  {
    m_response.version(11);
    m_response.result(status);
    if (!type.empty())
      m_response.set(http::field::content_type, boost::beast::string_view(type.data(), type.size()));
    m_response.set("X-Content-Type-Options", "nosniff");
    if (!m_origin.empty())
    {
      // The origin was admitted.
      m_response.set(http::field::access_control_allow_origin, m_origin);
      m_response.set(http::field::access_control_allow_headers, "Authorization, Content-Type");
      m_response.set(http::field::access_control_allow_methods, "GET, POST");
      m_response.set(http::field::vary, "Origin");
    }
    m_response.keep_alive(m_keepAlive && !m_core->closing);
    m_response.body() = std::move(body);
    if (status != http::status::no_content)
      m_response.prepare_payload();
    m_deadline = Clock::now() + transferTime;
    http::async_write(m_socket, m_response,
                      [self = shared_from_this()](error_code error, std::size_t) { self->OnSent(error); });
  }

  void OnSent(error_code error)
  {
    if (error)
      return Abort();
    if (m_response.keep_alive())
      return Read();
    // The rest of what the client sends is read and dropped for a while: to close on it would take back the answer.
    error_code ignored;
    m_socket.shutdown(Socket::shutdown_send, ignored);
    m_busy = false;
    m_deadline = Clock::now() + closingTime;
    Drain();
  }

  void Drain()
  {
    m_buffer.clear();
    m_socket.async_read_some(m_buffer.prepare(65536),
                             [self = shared_from_this()](error_code error, std::size_t)
                             {
                               if (error || self->m_core->closing)
                                 self->Abort();
                               else
                                 self->Drain();
                             });
  }

  const std::shared_ptr<Core> m_core;
  Socket m_socket;
  boost::beast::flat_buffer m_buffer;
  std::optional<http::request_parser<http::string_body>> m_parser;
  http::response<http::string_body> m_response;
  std::string m_origin;
  Clock::time_point m_deadline = Clock::time_point::max();
  bool m_busy = false;
  bool m_keepAlive = true;
};

}

void StartHttp(Socket socket, std::shared_ptr<Core> core)
{
  std::make_shared<HttpSession>(std::move(socket), std::move(core))->Read();
}

void RefuseHttp(Socket socket, std::shared_ptr<Core> core)
{
  std::make_shared<HttpSession>(std::move(socket), std::move(core))
      ->RespondAndClose(http::status::service_unavailable, "Too many connections.\n");
}

}
