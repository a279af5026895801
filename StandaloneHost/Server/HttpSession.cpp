#include "StandaloneHost/Server/HttpSession.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Server/Admission.h"
#include "StandaloneHost/Server/HttpOutput.h"
#include "StandaloneHost/Server/RequestHead.h"
#include "StandaloneHost/Server/WebSocketSession.h"

#include <boost/asio/write.hpp>
#include <boost/beast/core/flat_buffer.hpp>
#include <boost/beast/http.hpp>
#include <boost/beast/websocket/rfc6455.hpp>

#include <openssl/sslerr.h>

#include <algorithm>
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
constexpr std::size_t bodyBufferBytes = 65536; // for reading a body piece by piece
constexpr std::size_t chunkBytes = 8192;       // read at once of a body whose length is not known
constexpr std::size_t keptBytes = 4096;        // of the buffer, while the client says nothing
constexpr auto handshakeTime = std::chrono::seconds(10);
constexpr auto idleTime = std::chrono::seconds(60);
constexpr auto transferTime = std::chrono::seconds(30);
constexpr auto closingTime = std::chrono::seconds(2);

class HttpSession final : public IConnection, public std::enable_shared_from_this<HttpSession>
{
public:
  HttpSession(Socket socket, std::string peer, std::shared_ptr<Core> core)
      : m_core(std::move(core)), m_stream(std::move(socket), std::move(peer), m_core->tls.get())
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

  void Extend(Clock::duration pause) override
  {
    if (m_deadline != Clock::time_point::max())
      m_deadline += pause;
  }

  [[nodiscard]] std::optional<Clock::time_point> WaitsSince() const override { return m_waitsSince; }

  [[nodiscard]] std::optional<Clock::time_point> StrangerSince() const override
  {
    return m_known ? std::nullopt : std::optional(m_began);
  }

  [[nodiscard]] std::string Peer() const override { return m_stream.Peer(); }

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
    m_head = {};
    m_origin.clear();
    m_parser.emplace();
    m_parser->header_limit(headerBytes);
    m_parser->body_limit(m_core->options.limits.messageBytes);
    m_buffer.max_size(std::max(headerBytes, m_buffer.size()));
    if (m_buffer.size() == 0 && m_buffer.capacity() > keptBytes)
      m_buffer.shrink_to_fit();
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
    if (const auto refused = ReadHead(request, m_head))
      return RefuseHead(*refused);
    m_origin = m_head.origin;
    if (const EAdmission admission = Admission(); admission != EAdmission::Welcome)
      return Refuse(admission);
    if (boost::beast::websocket::is_upgrade(request))
      return Upgrade();
    if (m_head.hasBody && (m_head.method != http::verb::post || m_head.path != "/rpc"))
      return RefuseBody();
    if (m_head.awaitsContinue && m_buffer.size() == 0)
      return SendContinue();
    ReadBody();
  }

  void RefuseHead(const HeadError& refused)
  {
    m_core->refusals.Note(ERefusal::BadRequest, m_stream.Peer(), refused.text.substr(0, refused.text.size() - 1));
    RespondAndClose(refused.status, refused.text);
  }

  /// Answers what has a body that nobody wants to see. The rest of it is dropped with the connection.
  void RefuseBody()
  {
    m_keepAlive = false;
    OnRequest();
  }

  void Upgrade()
  {
    if (m_head.path != "/rpc")
      return RespondAndClose(http::status::not_found, "WebSockets are served at /rpc.\n");
    // What stands between could take it for another request.
    if (m_buffer.size() != 0)
      return RefuseHead({http::status::bad_request, "Something follows the upgrade before it is answered.\n"});
    if (m_core->webSockets >= m_core->options.limits.webSockets)
    {
      m_core->refusals.Note(ERefusal::TooManyConnections, m_stream.Peer(), "WebSockets");
      return RespondAndClose(http::status::service_unavailable, "Too many WebSockets.\n");
    }
    StartWebSocket(std::move(m_stream), http::request<http::string_body>(m_parser->get().base()),
                   OffersProtocol(m_head.webSocketProtocols), m_core);
  }

  [[nodiscard]] EAdmission Admission() const
  {
    const Document* document = m_core->documents.Find(m_head.path);
    const bool open = m_head.method == http::verb::options ||
                      ((m_head.method == http::verb::get || m_head.method == http::verb::head) && document != nullptr &&
                       document->open);
    return Admit({m_head.host, m_origin, m_head.authorisation, m_head.webSocketProtocols, open}, m_core->options);
  }

  void Refuse(EAdmission admission)
  {
    const Refusal refusal = RefusalFor(admission);
    const auto detail = refusal.kind == ERefusal::WrongOrigin ? std::string_view(m_origin)
                        : refusal.kind == ERefusal::WrongHost ? m_head.host
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

  /// Takes in what has come of the body, nearly always all of it with the header, and reads on if something is missing.
  void ReadBody()
  {
    // The end of a body in chunks has five bytes. With fewer, Beast's parser takes its first three for granted twice.
    const std::size_t least = m_parser->chunked() ? 5 : 1;
    error_code failed;
    while ((!failed || failed == http::error::need_more) && !m_parser->is_done() && m_buffer.size() >= least)
    {
      const std::size_t taken = m_parser->put(m_buffer.data(), failed);
      m_buffer.consume(taken);
      if (taken == 0)
        break;
    }
    if (failed && failed != http::error::need_more)
      return OnBadRequest(failed);
    if (m_parser->is_done())
      return OnRequest();
    m_buffer.max_size(bodyBufferBytes);
    if (m_buffer.size() >= bodyBufferBytes)
      return OnBadRequest(http::error::buffer_overflow);
    const auto missing = m_parser->content_length_remaining().value_or(chunkBytes);
    const std::size_t room = bodyBufferBytes - m_buffer.size();
    m_stream.async_read_some(m_buffer.prepare(static_cast<std::size_t>(std::min<std::uint64_t>(room, missing))),
                             [self = shared_from_this()](error_code error, std::size_t size)
                             {
                               if (error)
                                 return self->Abort(); // the client has gone
                               self->m_buffer.commit(size);
                               self->ReadBody();
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
    else if (error == http::error::header_limit ||
             (error == http::error::buffer_overflow && !m_parser->is_header_done()))
      refuse(http::status::request_header_fields_too_large, "The header is too long.\n");
    else if (error == http::error::buffer_overflow)
      refuse(http::status::bad_request, "What stands around the chunks of the body is too long.\n");
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
    if (m_head.method == http::verb::options)
      return Respond(http::status::no_content, {}, {});
    if (m_head.path == "/rpc")
    {
      if (m_head.method == http::verb::post)
        return Call();
      return RespondWithAllow("POST, OPTIONS", "Calls are posted; a GET needs a WebSocket upgrade.\n");
    }
    const Document* document = m_core->documents.Find(m_head.path);
    if (document == nullptr)
      return Respond(http::status::not_found, "text/plain; charset=utf-8", "There is nothing here.\n");
    if (m_head.method != http::verb::get && m_head.method != http::verb::head)
      return RespondWithAllow("GET, HEAD, OPTIONS", "This can only be read.\n");
    m_known = m_known || (!document->open && !m_core->options.token.empty());
    // The document outlives the answer: many who read it slowly take no memory for it.
    Send(Output(Head(http::status::ok, document->type, {}), *document->text));
  }

  void Call()
  {
    m_known = true;
    try
    {
      // No notifications without a WebSocket. The body stays until the next request is read.
      m_core->dispatcher.Handle(m_parser->get().body(), m_caller, nullptr,
                                [self = shared_from_this()](ResponseText answer, std::size_t)
                                { self->OnAnswer(std::move(answer)); });
    }
    catch (const std::exception& failure)
    {
      NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "A message could not be handled: %1%", failure.what());
      RespondAndClose(http::status::internal_server_error, "The message could not be handled.\n");
    }
  }

  void OnAnswer(ResponseText answer)
  {
    if (answer.Empty())
      return Respond(http::status::no_content, {}, {});
    Send(m_output.Put(Head(http::status::ok, "application/json", {}), std::move(answer)));
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
    Send(Output(Head(status, type, fields), body));
  }

  /// Who asks for the head alone is told how long the body would be.
  [[nodiscard]] HttpOutput::Buffers Output(const HttpHead& head, std::string_view body)
  {
    return m_head.method == http::verb::head ? m_output.PutHead(head, body.size()) : m_output.Put(head, body);
  }

  [[nodiscard]] HttpHead Head(http::status status, std::string_view type, std::string_view fields)
  {
    m_keepAlive = m_keepAlive && !m_core->closing;
    return {status, fields, type, m_origin, m_keepAlive, m_oldVersion};
  }

  void Send(HttpOutput::Buffers buffers)
  {
    AwaitClient(transferTime);
    const auto sent = [self = shared_from_this()](error_code error, std::size_t) { self->OnSent(error); };
    if (buffers.size() == 1)
      boost::asio::async_write(m_stream, boost::asio::buffer(buffers.front()), sent);
    else
      boost::asio::async_write(m_stream, std::move(buffers), sent);
  }

  void OnSent(error_code error)
  {
    if (error)
      return Abort();
    m_output.Clear();
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
  RequestHead m_head; // looks into what the parser has
  HttpOutput m_output{m_core->outgoing};
  std::string m_origin;
  const Clock::time_point m_began = Clock::now();
  Clock::time_point m_deadline = Clock::time_point::max();
  std::optional<Clock::time_point> m_waitsSince;
  bool m_busy = false;
  bool m_known = false; // has called, or shown the token
  bool m_keepAlive = true;
  bool m_oldVersion = false; // HTTP/1.0: it is told when the connection is kept
};

}

void StartHttp(Socket socket, std::string peer, std::shared_ptr<Core> core)
{
  std::make_shared<HttpSession>(std::move(socket), std::move(peer), std::move(core))->Start();
}

void RefuseHttp(Socket socket, std::string peer, std::shared_ptr<Core> core)
{
  const auto session = std::make_shared<HttpSession>(std::move(socket), std::move(peer), std::move(core));
  if (!session->Encrypted())
    session->RespondAndClose(http::status::service_unavailable, "Too many connections.\n");
}

}
