#include "StandaloneHost/Server/HttpSession.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Server/Admission.h"
#include "StandaloneHost/Server/HttpHead.h"
#include "StandaloneHost/Server/WebSocketSession.h"

#include <boost/asio/write.hpp>
#include <boost/beast/core/flat_buffer.hpp>
#include <boost/beast/http.hpp>
#include <boost/beast/websocket/rfc6455.hpp>

#include <openssl/sslerr.h>

#include <array>
#include <optional>
#include <utility>

namespace Server
{

namespace http = boost::beast::http;
using boost::system::error_code;
using Clock = std::chrono::steady_clock;

namespace
{

constexpr std::size_t headerBytes = 16384;
constexpr auto handshakeTime = std::chrono::seconds(10);
constexpr auto idleTime = std::chrono::seconds(60);
constexpr auto transferTime = std::chrono::seconds(30);
constexpr auto closingTime = std::chrono::seconds(2);

struct Refusal
{
  ERefusal kind;
  http::status status;
  std::string_view text; ///< for the visitor
};

Refusal RefusalFor(EAdmission admission)
{
  switch (admission)
  {
  case EAdmission::NoToken:
    return {ERefusal::NoToken, http::status::unauthorized,
            "The token is missing or wrong: send \"Authorization: Bearer TOKEN\".\n"};
  case EAdmission::WrongOrigin:
    return {ERefusal::WrongOrigin, http::status::forbidden,
            "Web pages of this origin may not connect; the host allows them with --allow-origin.\n"};
  case EAdmission::WrongHost:
  case EAdmission::Welcome:
    break;
  }
  return {ERefusal::WrongHost, http::status::forbidden,
          "This host is reached by its address or as localhost, not by that name.\n"};
}

std::string_view ToView(boost::beast::string_view text)
{
  return {text.data(), text.size()};
}

class HttpSession final : public IConnection, public std::enable_shared_from_this<HttpSession>
{
public:
  HttpSession(Socket socket, std::shared_ptr<Core> core)
      : m_core(std::move(core)), m_stream(std::move(socket), m_core->tls.get())
  {
    m_core->connections.Add(*this);
  }

  ~HttpSession() { m_core->connections.Remove(*this); }

  void Start()
  {
    if (!m_stream.Encrypted())
      return Read();
    AwaitClient(handshakeTime);
    m_stream.async_handshake([self = shared_from_this()](error_code error) { self->OnHandshake(error); });
  }

  void RespondAndClose(http::status status, std::string_view text)
  {
    m_keepAlive = false;
    Respond(status, "text/plain; charset=utf-8", text);
  }

  [[nodiscard]] bool Encrypted() const { return m_stream.Encrypted(); }

  void Close() override
  {
    m_keepAlive = false;
    if (!m_busy)
      Abort();
  }

  void Abort() override { m_stream.close(); }

  void Tick(Clock::time_point now) override
  {
    if (now <= m_deadline)
      return;
    if (m_busy)
      m_core->refusals.Note(ERefusal::Overdue, m_stream.Peer(), {});
    Abort();
  }

  [[nodiscard]] std::optional<Clock::time_point> WaitsSince() const override { return m_waitsSince; }

  [[nodiscard]] std::weak_ptr<IConnection> Weak() override { return weak_from_this(); }

private:
  /// The client has so long to do its part, and may be ended meanwhile to make room for another.
  void AwaitClient(Clock::duration time)
  {
    m_waitsSince = Clock::now();
    m_deadline = *m_waitsSince + time;
  }

  void OnHandshake(error_code error)
  {
    if (!error)
      return Read();
    if (error.category() == boost::asio::error::get_ssl_category())
      m_core->refusals.Note(ERefusal::BadHandshake, m_stream.Peer(), error.message());
    if (error.category() != boost::asio::error::get_ssl_category() ||
        ERR_GET_REASON(static_cast<unsigned long>(error.value())) != SSL_R_HTTP_REQUEST)
      return Abort();
    static constexpr std::string_view text = "HTTP/1.1 400 Bad Request\r\nConnection: close\r\n"
                                             "Content-Type: text/plain\r\n\r\nThis port speaks https.\n";
    boost::asio::async_write(m_stream.Plain(), boost::asio::buffer(text),
                             [self = shared_from_this()](error_code, std::size_t) { self->Abort(); });
  }

  /// Waits for the next request.
  void Read()
  {
    m_busy = false;
    m_parser.emplace();
    m_parser->header_limit(headerBytes);
    m_parser->body_limit(m_core->options.limits.messageBytes);
    AwaitClient(idleTime);
    http::async_read_header(m_stream, m_buffer, *m_parser,
                            [self = shared_from_this()](error_code error, std::size_t) { self->OnHeader(error); });
  }

  void OnHeader(error_code error)
  {
    m_busy = true;
    if (error)
      return OnBadRequest(error);
    AwaitClient(transferTime);

    const auto& request = m_parser->get();
    m_keepAlive = request.keep_alive() && !m_core->closing;
    m_oldVersion = request.version() < 11;
    m_origin = request[http::field::origin];
    if (const EAdmission admission = Admission(); admission != EAdmission::Welcome)
      return Refuse(admission);
    if (boost::beast::websocket::is_upgrade(request))
    {
      if (request.target() != "/rpc")
        return RespondAndClose(http::status::not_found, "WebSockets are served at /rpc.\n");
      if (m_core->webSockets >= m_core->options.limits.webSockets)
      {
        m_core->refusals.Note(ERefusal::TooManyConnections, m_stream.Peer(), "WebSockets");
        return RespondAndClose(http::status::service_unavailable, "Too many WebSockets.\n");
      }
      return StartWebSocket(std::move(m_stream), http::request<http::string_body>(request.base()), m_core);
    }
    if (request[http::field::expect] == "100-continue")
      return SendContinue();
    ReadBody();
  }

  [[nodiscard]] EAdmission Admission() const
  {
    const auto& request = m_parser->get();
    const Document* document = m_core->documents.Find(ToView(request.target()));
    const bool open = request.method() == http::verb::options ||
                      (request.method() == http::verb::get && document != nullptr && document->open);
    return Admit({ToView(request[http::field::host]), m_origin, ToView(request[http::field::authorization]),
                  ToView(request[http::field::sec_websocket_protocol]), open},
                 m_core->options);
  }

  void Refuse(EAdmission admission)
  {
    const Refusal refusal = RefusalFor(admission);
    const auto& request = m_parser->get();
    const auto detail = refusal.kind == ERefusal::WrongOrigin ? ToView(m_origin)
                        : refusal.kind == ERefusal::WrongHost ? ToView(request[http::field::host])
                                                              : std::string_view{};
    m_core->refusals.Note(refusal.kind, m_stream.Peer(), detail);
    m_origin.clear();
    RespondAndClose(refusal.status, refusal.text);
  }

  void SendContinue()
  {
    static constexpr std::string_view text = "HTTP/1.1 100 Continue\r\n\r\n";
    boost::asio::async_write(m_stream, boost::asio::buffer(text),
                             [self = shared_from_this()](error_code error, std::size_t)
                             {
                               if (!error)
                                 self->ReadBody();
                             });
  }

  void ReadBody()
  {
    // Nearly always the body has come with the header: then it needs no operation of its own.
    error_code failed;
    while (!failed && !m_parser->is_done() && m_buffer.size() != 0)
      m_buffer.consume(m_parser->put(m_buffer.data(), failed));
    if (failed && failed != http::error::need_more)
      return OnBadRequest(failed);
    if (m_parser->is_done())
      return OnRequest();
    http::async_read(m_stream, m_buffer, *m_parser,
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
    const auto refuse = [&](http::status status, const std::string& text)
    {
      m_core->refusals.Note(ERefusal::BadRequest, m_stream.Peer(), std::string_view(text).substr(0, text.size() - 1));
      RespondAndClose(status, text);
    };
    if (error == http::error::body_limit)
      refuse(http::status::payload_too_large,
             "The message is longer than " + std::to_string(m_core->options.limits.messageBytes) + " bytes.\n");
    else if (error == http::error::header_limit)
      refuse(http::status::request_header_fields_too_large, "The header is too long.\n");
    else if (error == http::error::end_of_stream || error == http::error::partial_message ||
             error.category() != make_error_code(http::error::end_of_stream).category())
      Abort(); // the client has gone
    else
      refuse(http::status::bad_request, "Not an HTTP request: " + error.message() + ".\n");
  }

  void OnRequest()
  {
    m_waitsSince.reset();
    m_deadline = Clock::time_point::max();
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
    // The document outlives the answer: many who read it slowly take no memory for it.
    m_reply = HeadText(Head(http::status::ok, document->type, {}), document->text.size(), 0);
    Send(boost::asio::buffer(document->text));
  }

  void Call()
  {
    try
    {
      // No notifications without a WebSocket. The body stays until the next request is read.
      m_core->dispatcher.Handle(m_parser->get().body(), m_caller, nullptr,
                                [self = shared_from_this()](std::string answer, std::size_t)
                                {
                                  if (answer.empty())
                                    self->Respond(http::status::no_content, {}, {});
                                  else
                                    self->Respond(http::status::ok, "application/json", answer);
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
    const std::string allow = "Allow: " + std::string(methods) + "\r\n";
    Respond(http::status::method_not_allowed, "text/plain; charset=utf-8", text, allow);
  }

  /// Answers with a text of which a copy is sent, and with fields of this answer alone.
  void Respond(http::status status, std::string_view type, std::string_view body, std::string_view fields = {})
  {
    if (status == http::status::unauthorized)
      fields = "WWW-Authenticate: Bearer\r\n";
    m_reply = HeadText(Head(status, type, fields), body.size(), body.size());
    m_reply += body;
    Send({});
  }

  [[nodiscard]] HttpHead Head(http::status status, std::string_view type, std::string_view fields)
  {
    m_keepAlive = m_keepAlive && !m_core->closing;
    return {status, fields, type, m_origin, m_keepAlive, m_oldVersion};
  }

  /// Sends the reply, and after it what stays where it is.
  void Send(boost::asio::const_buffer rest)
  {
    AwaitClient(transferTime);
    const auto sent = [self = shared_from_this()](error_code error, std::size_t) { self->OnSent(error); };
    if (rest.size() == 0)
      boost::asio::async_write(m_stream, boost::asio::buffer(m_reply), sent);
    else
      boost::asio::async_write(m_stream, std::array{boost::asio::const_buffer(boost::asio::buffer(m_reply)), rest},
                               sent);
  }

  void OnSent(error_code error)
  {
    if (error)
      return Abort();
    std::string().swap(m_reply);
    if (m_keepAlive)
      return Read();
    // The rest of what the client sends is read and dropped for a while: to close on it would take back the answer.
    m_busy = false;
    AwaitClient(closingTime);
    m_stream.async_end([self = shared_from_this()] { self->Abort(); });
  }

  const std::shared_ptr<Core> m_core;
  const NMX::Caller m_caller{++m_core->lastCaller};
  ClientStream m_stream;
  boost::beast::flat_buffer m_buffer;
  std::optional<http::request_parser<http::string_body>> m_parser;
  std::string m_reply;
  std::string m_origin;
  Clock::time_point m_deadline = Clock::time_point::max();
  std::optional<Clock::time_point> m_waitsSince;
  bool m_busy = false;
  bool m_keepAlive = true;
  bool m_oldVersion = false; // HTTP/1.0: it is told when the connection is kept
};

}

void StartHttp(Socket socket, std::shared_ptr<Core> core)
{
  std::make_shared<HttpSession>(std::move(socket), std::move(core))->Start();
}

void RefuseHttp(Socket socket, std::shared_ptr<Core> core)
{
  const auto session = std::make_shared<HttpSession>(std::move(socket), std::move(core));
  if (!session->Encrypted())
    session->RespondAndClose(http::status::service_unavailable, "Too many connections.\n");
}

}
