#include "StandaloneHost/Server/WebSocketSession.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Server/Admission.h"
#include "StandaloneHost/Server/CoalescingStream.h"

#include <boost/beast/core/flat_buffer.hpp>
#include <boost/beast/http/field.hpp>
#include <boost/beast/websocket.hpp>

#include <algorithm>
#include <optional>
#include <utility>

namespace Server
{

namespace http = boost::beast::http;
namespace websocket = boost::beast::websocket;
using boost::system::error_code;
using Clock = std::chrono::steady_clock;

namespace
{

constexpr auto handshakeTime = std::chrono::seconds(10);
constexpr auto closingTime = std::chrono::seconds(2);
constexpr std::size_t wholeBytes = std::size_t{64} << 10; // a longer message is sent in pieces
constexpr std::size_t keptBuffer = std::size_t{64} << 10; // for the next message; what a long one took is given back

std::string_view View(const boost::beast::flat_buffer& buffer)
{
  return {static_cast<const char*>(buffer.cdata().data()), buffer.size()};
}

/// Beast checks texts as they come, but not the end of one whose last frame is empty.
bool EndsWithinCharacter(std::string_view text)
{
  for (std::size_t back = 1; back <= std::min<std::size_t>(3, text.size()); ++back)
  {
    const auto byte = static_cast<unsigned char>(text[text.size() - back]);
    if (byte >= 0xC0)
      return back < (byte >= 0xF0 ? 4U : byte >= 0xE0 ? 3U : 2U);
    if (byte < 0x80)
      return false;
  }
  return false;
}

/// One WebSocket client: reads its messages, and queues what is for it. Beast reads, and writes what the protocol asks
/// for by itself (handshake, pong, close); messages go straight into the stream beneath it.
class WebSocketSession final : public IListener,
                               public IConnection,
                               public std::enable_shared_from_this<WebSocketSession>
{
public:
  WebSocketSession(ClientStream client, std::shared_ptr<Core> core)
      : m_core(std::move(core)), m_stream(CoalescingStream(std::move(client), m_core->outgoing)),
        m_queue(m_core->options.limits, m_core->outgoing)
  {
    m_core->connections.Add(*this);
    ++m_core->webSockets;
  }

  ~WebSocketSession()
  {
    m_core->notifier.Forget(*this);
    m_core->connections.Remove(*this);
    --m_core->webSockets;
  }

  void Start(const http::request<http::string_body>& request, bool offersProtocol)
  {
    m_deadline = Clock::now() + handshakeTime;
    m_stream.read_message_max(m_core->options.limits.messageBytes);
    if (offersProtocol)
      m_stream.set_option(websocket::stream_base::decorator(
          [](websocket::response_type& response)
          { response.set(http::field::sec_websocket_protocol, webSocketProtocol.data()); }));
    m_stream.async_accept(request, [self = shared_from_this()](error_code error) { self->OnAccepted(error); });
    m_stream.next_layer().FlushSoon();
  }

  void Notify(const SharedMessage& message, EPolicy policy, const void* callback) override
  {
    Send(message, policy, callback);
  }

  void Close() override { Close(websocket::close_code::going_away, "the host is shutting down"); }

  void Abort() override
  {
    m_closing = true;
    m_closeBegun = true;
    m_core->notifier.Forget(*this);
    Client().close();
  }

  void Tick(Clock::time_point now) override
  {
    if (now > m_deadline || now > m_stream.next_layer().TeardownDeadline())
      return Abort();
    if (!m_open || m_closing)
      return;
    // While calls are carried out or waited for, nothing may be read.
    if (m_stream.next_layer().TakeSignOfLife() || m_callsInFlight > 0 || m_waitsForOthers)
    {
      m_lastSign = now;
      m_pinged.reset();
      return;
    }
    const std::chrono::seconds pingAfter(m_core->options.limits.pingAfterSeconds);
    if (!m_pinged && now - m_lastSign > pingAfter)
    {
      m_stream.next_layer().GatherPing();
      m_pinged = now;
    }
    else if (m_pinged && now - *m_pinged > pingAfter)
    {
      m_core->refusals.Note(ERefusal::Silent, Client().Peer(), {});
      Abort();
    }
  }

  void Extend(Clock::duration pause) override
  {
    if (m_deadline != Clock::time_point::max())
      m_deadline += pause;
    m_lastSign += pause;
    if (m_pinged)
      *m_pinged += pause;
    m_stream.next_layer().ExtendTeardown(pause);
  }

  [[nodiscard]] std::string Peer() const override { return m_stream.next_layer().next_layer().Peer(); }

  void ReadOn() override
  {
    m_waitsForOthers = false;
    Read();
  }

  [[nodiscard]] std::weak_ptr<IConnection> Weak() override { return weak_from_this(); }

private:
  void OnAccepted(error_code error)
  {
    if (error)
    {
      // Beast has worded why; the client is told before the connection ends.
      m_core->refusals.Note(ERefusal::BadHandshake, Client().Peer(), error.message());
      m_closing = true;
      m_deadline = Clock::now() + closingTime;
      return m_stream.next_layer().Teardown([self = shared_from_this()](error_code) { self->Abort(); });
    }
    m_open = true;
    m_deadline = Clock::time_point::max();
    m_lastSign = Clock::now();
    Send(std::make_shared<const ResponseText>(m_core->dispatcher.Hello(++m_core->lastSession)), EPolicy::Reply,
         nullptr);
    if (m_core->closing)
      return Close();
    Read();
  }

  void Read()
  {
    if (m_reading || m_closing || m_waitsForOthers)
      return;
    if (m_callsInFlight >= static_cast<std::ptrdiff_t>(m_core->options.limits.callsInFlight))
      return;
    m_waitsForOthers = !m_core->calls.MayBegin(shared_from_this());
    if (m_waitsForOthers)
      return;
    m_reading = true;
    m_stream.async_read(m_buffer, [self = shared_from_this()](error_code error, std::size_t) { self->OnRead(error); });
  }

  void OnRead(error_code error)
  {
    m_stream.next_layer().InputArrived();
    if (error)
    {
      m_reading = false;
      // The client has gone, or Beast has already told it what it did wrong.
      if (!m_closing && error.category() == make_error_code(websocket::error::closed).category() &&
          error != websocket::error::closed)
        m_core->refusals.Note(ERefusal::BrokenProtocol, Client().Peer(), error.message());
      m_closing = true;
      m_core->notifier.Forget(*this);
      m_deadline = Clock::now() + closingTime;
      m_stream.next_layer().Flush();
      return;
    }
    if (!m_closing && m_stream.got_text() && EndsWithinCharacter(View(m_buffer)))
      Close(websocket::close_code::bad_payload, "the text ends within a character");
    else if (!m_closing && m_stream.got_text())
      Handle();
    else if (!m_closing)
      Close(websocket::close_code::unknown_data, "text frames only");
    // Until here the message lies in the buffer, so nothing is read into it, even when the answer is given at once.
    m_buffer.clear();
    if (m_buffer.capacity() > keptBuffer)
      m_buffer.shrink_to_fit();
    m_reading = false;
    Read();
    if (!m_reading)
      m_stream.next_layer().FlushSoon();
  }

  void Handle()
  {
    const std::string_view text = View(m_buffer);
    try
    {
      Count(static_cast<std::ptrdiff_t>(
          m_core->dispatcher.Handle(text, m_caller, this,
                                    [self = shared_from_this()](ResponseText answer, std::size_t calls)
                                    { self->OnAnswer(std::move(answer), calls); })));
    }
    catch (const std::exception& failure)
    {
      NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "A message could not be handled: %1%", failure.what());
      Close(websocket::close_code::internal_error, "the message could not be handled");
    }
  }

  void Count(std::ptrdiff_t calls)
  {
    m_callsInFlight += calls;
    m_core->calls.Count(calls);
  }

  void OnAnswer(ResponseText answer, std::size_t calls)
  {
    Count(-static_cast<std::ptrdiff_t>(calls));
    if (!answer.Empty())
      Send(std::make_shared<const ResponseText>(std::move(answer)), EPolicy::Reply, nullptr);
    if (m_open)
      Read();
  }

  void Send(SharedMessage message, EPolicy policy, const void* callback)
  {
    // While closing, only answers to what was accepted still go out.
    if (m_closeBegun || !m_open || (m_closing && policy != EPolicy::Reply))
      return;
    if (m_queue.Push(std::move(message), policy, callback))
      Pump();
    else if (!m_closing)
    {
      m_core->refusals.Note(ERefusal::SlowReader, Client().Peer(), {});
      Close(websocket::close_code::try_again_later, "reads too slowly");
    }
  }

  /// Moves what waits into the stream as far as there is room.
  void Pump()
  {
    CoalescingStream& stream = m_stream.next_layer();
    // Once one of the two has said goodbye, nothing may follow but the rest of a message.
    const bool over = m_closeBegun || !m_stream.is_open();
    while (!m_queue.Empty() && stream.HasRoom() && (!over || stream.Missing() != 0))
      GatherFront(stream);
    if (over && stream.Missing() == 0)
      m_queue.Clear();
    else if (!m_queue.Empty())
      stream.WhenRoom([self = shared_from_this()] { self->Pump(); }); // what waits keeps the session
    else if (m_closing)
      BeginClose();
    else if (!m_reading)
      stream.FlushSoon();
  }

  /// Moves the first message, or as much of a long one as there is room for.
  void GatherFront(CoalescingStream& stream)
  {
    const ResponseText& text = *m_queue.Front();
    if (stream.Missing() == 0 && text.IsPlain() && text.Size() <= wholeBytes)
    {
      stream.GatherText(text.Own());
      return m_queue.Pop();
    }
    if (stream.Missing() == 0)
      stream.BeginText(text.Size());
    for (std::string_view piece : text.PiecesFrom(text.Size() - stream.Missing()))
    {
      while (!piece.empty() && stream.HasRoom())
        piece.remove_prefix(stream.GatherPiece(piece));
      if (!piece.empty())
        return;
    }
    m_queue.Pop();
  }

  void Close(websocket::close_code code, const char* reason)
  {
    if (m_closing)
      return;
    m_closing = true;
    m_reason = websocket::close_reason(code, reason);
    m_core->notifier.Forget(*this);
    m_deadline = Clock::now() + closingTime;
    if (m_queue.Empty())
      BeginClose();
  }

  void BeginClose()
  {
    if (m_closeBegun || !m_open || !m_stream.is_open())
      return;
    m_closeBegun = true;
    m_stream.async_close(m_reason, [self = shared_from_this()](error_code) {});
    m_stream.next_layer().FlushSoon();
  }

  ClientStream& Client() { return m_stream.next_layer().next_layer(); }

  const std::shared_ptr<Core> m_core;
  const NMX::Caller m_caller{++m_core->lastCaller};
  websocket::stream<CoalescingStream> m_stream;
  boost::beast::flat_buffer m_buffer;
  OutgoingQueue m_queue;
  websocket::close_reason m_reason;
  Clock::time_point m_deadline = Clock::time_point::max();
  Clock::time_point m_lastSign; // when the client was last known to be there
  std::ptrdiff_t m_callsInFlight = 0;
  std::optional<Clock::time_point> m_pinged; // since then nothing has come
  bool m_waitsForOthers = false;
  bool m_open = false;
  bool m_reading = false;
  bool m_closing = false;
  bool m_closeBegun = false;
};

}

void StartWebSocket(ClientStream stream, const http::request<http::string_body>& request, bool offersProtocol,
                    std::shared_ptr<Core> core)
{
  std::make_shared<WebSocketSession>(std::move(stream), std::move(core))->Start(request, offersProtocol);
}

}
