#include "StandaloneHost/Server/WebSocketSession.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Server/CoalescingStream.h"

#include <boost/beast/core/flat_buffer.hpp>
#include <boost/beast/http/field.hpp>
#include <boost/beast/websocket.hpp>

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
constexpr std::size_t keptBuffer = std::size_t{64} << 10; // for the next message; what a long one took is given back

/// One WebSocket client: reads its messages, and queues what is for it. Beast reads, and writes what the protocol asks
/// for by itself (handshake, pong, close); messages go straight into the stream beneath it.
class WebSocketSession final : public IListener,
                               public IConnection,
                               public std::enable_shared_from_this<WebSocketSession>
{
public:
  WebSocketSession(Socket socket, std::shared_ptr<Core> core)
      : m_core(std::move(core)), m_stream(CoalescingStream(std::move(socket))), m_queue(m_core->options.limits)
  {
    m_core->connections.Add(*this);
  }

  ~WebSocketSession()
  {
    m_core->notifier.Forget(*this);
    m_core->connections.Remove(*this);
  }

  void Start(const http::request<http::string_body>& request)
  {
    m_deadline = Clock::now() + handshakeTime;
    m_stream.read_message_max(m_core->options.limits.messageBytes);
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
    error_code ignored;
    m_stream.next_layer().next_layer().close(ignored);
  }

  [[nodiscard]] bool Overdue(Clock::time_point now) const override
  {
    return now > m_deadline || now > m_stream.next_layer().TeardownDeadline();
  }

  [[nodiscard]] std::weak_ptr<IConnection> Weak() override { return weak_from_this(); }

private:
  void OnAccepted(error_code error)
  {
    if (error)
      return Abort();
    m_open = true;
    m_deadline = Clock::time_point::max();
    Send(std::make_shared<const std::string>(m_core->dispatcher.Hello(++m_core->lastSession)), EPolicy::Reply, nullptr);
    if (m_core->closing)
      return Close();
    Read();
  }

  void Read()
  {
    if (m_reading || m_closing)
      return;
    if (m_callsInFlight >= static_cast<std::ptrdiff_t>(m_core->options.limits.callsInFlight))
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
      m_closing = true;
      m_core->notifier.Forget(*this);
      m_deadline = Clock::now() + closingTime;
      m_stream.next_layer().Flush();
      return;
    }
    if (!m_closing && m_stream.got_text())
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
    const auto data = m_buffer.cdata();
    const std::string_view text(static_cast<const char*>(data.data()), data.size());
    try
    {
      m_callsInFlight += static_cast<std::ptrdiff_t>(
          m_core->dispatcher.Handle(text, this, [self = shared_from_this()](std::string answer, std::size_t calls)
                                    { self->OnAnswer(std::move(answer), calls); }));
    }
    catch (const std::exception& failure)
    {
      NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "A message could not be handled: %1%", failure.what());
      Close(websocket::close_code::internal_error, "the message could not be handled");
    }
  }

  void OnAnswer(std::string answer, std::size_t calls)
  {
    m_callsInFlight -= static_cast<std::ptrdiff_t>(calls);
    if (!answer.empty())
      Send(std::make_shared<const std::string>(std::move(answer)), EPolicy::Reply, nullptr);
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
      NMX::Log(NMX::serverLog, NMX::ESeverity::Notice, "A client that reads too slowly is closed.");
      Close(websocket::close_code::try_again_later, "reads too slowly");
    }
  }

  /// Moves what waits into the stream as far as there is room.
  void Pump()
  {
    CoalescingStream& stream = m_stream.next_layer();
    if (m_closeBegun || !m_stream.is_open())
    {
      // One of the two has said goodbye; nothing may follow that.
      m_queue.Clear();
      return;
    }
    while (!m_queue.Empty() && stream.HasRoom())
      stream.GatherText(*m_queue.Pop());
    if (!m_queue.Empty())
      stream.WhenRoom([self = shared_from_this()] { self->Pump(); }); // what waits keeps the session
    else if (m_closing)
      BeginClose();
    else if (!m_reading)
      stream.FlushSoon();
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

  const std::shared_ptr<Core> m_core;
  websocket::stream<CoalescingStream> m_stream;
  boost::beast::flat_buffer m_buffer;
  OutgoingQueue m_queue;
  websocket::close_reason m_reason;
  Clock::time_point m_deadline = Clock::time_point::max();
  std::ptrdiff_t m_callsInFlight = 0;
  bool m_open = false;
  bool m_reading = false;
  bool m_closing = false;
  bool m_closeBegun = false;
};

}

void StartWebSocket(Socket socket, http::request<http::string_body> request, std::shared_ptr<Core> core)
{
  std::make_shared<WebSocketSession>(std::move(socket), std::move(core))->Start(request);
}

}
