#pragma once

#include "StandaloneHost/Server/ClientStream.h"
#include "StandaloneHost/Server/OutgoingBytes.h"

#include <boost/asio/post.hpp>
#include <boost/asio/write.hpp>
#include <boost/beast/core/bind_handler.hpp>
#include <boost/beast/core/role.hpp>
#include <boost/beast/websocket/teardown.hpp>

#include <algorithm>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

namespace Server
{

/// A stream between a WebSocket and its client that gathers what is to be sent, because one system call for each
/// message costs more than all the rest of answering it.
///
/// A write is done as soon as it has been copied. What has gathered is sent in one go when everything that has been
/// received is worked through (the reader asks the client's stream for more, and whatever is ready to run has run),
/// when Flush is called, or when much has gathered. While too much is still being sent, there is no room for more.
/// [server]
class CoalescingStream
{
public:
  using executor_type = boost::asio::io_context::executor_type;
  using next_layer_type = ClientStream;
  using error_code = boost::system::error_code;

  CoalescingStream(ClientStream client, std::shared_ptr<OutgoingBytes> outgoing)
      : m_state(std::make_shared<State>(std::move(client), std::move(outgoing)))
  {
  }
  CoalescingStream(CoalescingStream&&) = default;
  CoalescingStream& operator=(CoalescingStream&&) = default;

  ~CoalescingStream()
  {
    if (m_state)
      m_state->client.close();
  }

  executor_type get_executor() noexcept { return m_state->client.get_executor(); }
  next_layer_type& next_layer() { return m_state->client; }
  const next_layer_type& next_layer() const { return m_state->client; }

  /// To be called when a message has arrived: what is sent from now on gathers until the reader asks for more.
  void InputArrived() { m_state->inputDrained = false; }

  /// Sends what has gathered, now.
  void Flush() { State::Flush(m_state); }

  /// Sends what has gathered once whatever is ready to run has run.
  void FlushSoon() { State::FlushSoon(m_state); }

  [[nodiscard]] bool HasRoom() const { return m_state->HasRoom(); }

  /// Whether the client has sent something, or taken over much, since this was last asked.
  [[nodiscard]] bool TakeSignOfLife() { return std::exchange(m_state->signOfLife, false); }

  /// Calls `task` once there is room again, or nothing can be sent any more.
  void WhenRoom(std::function<void()> task)
  {
    m_state->whenRoom = std::move(task);
    Flush();
  }

  /// Gathers one text message as a WebSocket server frames it: final, unmasked, not compressed. The frame is whole, so
  /// it may stand between any two frames of the WebSocket's own (pong, close). Going through the WebSocket's own
  /// writing for each message would cost as much as parsing and carrying it out.
  void GatherText(std::string_view text)
  {
    m_state->AppendTextHead(text.size());
    m_state->Append(text);
    OnGathered();
  }

  /// The same in pieces, so that no more of a long message is copied than there is room for: begins one of that length.
  void BeginText(std::size_t size)
  {
    m_state->AppendTextHead(size);
    m_state->missing = size;
  }

  /// How much of the message that has begun is still to come. Until then, frames of the WebSocket's own wait.
  [[nodiscard]] std::size_t Missing() const { return m_state->missing; }

  /// Takes what there is room for of the next piece, all of it once nothing can be sent any more; returns how much.
  std::size_t GatherPiece(std::string_view piece)
  {
    const std::string_view taken = piece.substr(0, HasRoom() ? sendAt : 0);
    m_state->Append(taken);
    m_state->missing -= std::min(taken.size(), m_state->missing);
    OnGathered();
    return taken.size();
  }

  /// Asks the client for a sign of life.
  void GatherPing()
  {
    if (Missing() == 0) // otherwise the client reads, or shows in the end that it does not
      m_state->Append(std::string_view("\x89\0", 2));
    FlushSoon();
  }

  template <class Buffers, class Handler>
  void async_read_some(const Buffers& buffers, Handler&& handler)
  {
    // More is asked for once something has come.
    m_state->signOfLife = true;
    m_state->inputDrained = true;
    ++m_state->reads;
    // First, so that what is there already is worked through before anything is sent.
    m_state->client.async_read_some(buffers, std::forward<Handler>(handler));
    FlushSoon();
  }

  template <class Buffers, class Handler>
  auto async_write_some(const Buffers& buffers, Handler&& handler)
  {
    return boost::asio::async_initiate<Handler, void(error_code, std::size_t)>(
        [](auto completion, State& state, const Buffers& data) { state.Gather(data, std::move(completion)); }, handler,
        *m_state, buffers);
  }

  /// Ends the stream: sends what waits, then tells the client that nothing more comes, and reads and drops what it
  /// still sends until it closes too. To close at once would take back the last message, which says why. Calls
  /// `handler` in the end; whoever owns the stream closes the socket of a client that takes longer than until
  /// TeardownDeadline.
  template <class Handler>
  void Teardown(Handler&& handler)
  {
    auto held = std::make_shared<std::decay_t<Handler>>(std::forward<Handler>(handler));
    m_state->teardownDeadline = std::chrono::steady_clock::now() + teardownTime;
    m_state->whenDrained = [state = m_state.get(), held]
    { state->client.async_end([kept = state->shared_from_this(), held] { (*held)(error_code{}); }); };
    if (m_state->sending || !m_state->gathered.empty())
      Flush();
    else
      boost::asio::post(get_executor(), [state = m_state] { State::OnSent(state, state->error); });
  }

  /// When the end of the stream has taken too long; far away until it begins.
  [[nodiscard]] std::chrono::steady_clock::time_point TeardownDeadline() const { return m_state->teardownDeadline; }

  void ExtendTeardown(std::chrono::steady_clock::duration pause)
  {
    if (TeardownDeadline() != std::chrono::steady_clock::time_point::max())
      m_state->teardownDeadline += pause;
  }

private:
  void OnGathered()
  {
    if (m_state->inputDrained)
      FlushSoon();
    else if (m_state->gathered.size() >= sendAt)
      Flush();
  }

  static constexpr std::size_t sendAt = std::size_t{64} << 10;
  static constexpr std::size_t keptBytes = std::size_t{16} << 10; // what more took is given back
  static constexpr int mostPostponed = 16;
  static constexpr std::size_t waitAt = std::size_t{256} << 10;
  static constexpr auto teardownTime = std::chrono::seconds(2);

  struct State : std::enable_shared_from_this<State>
  {
    State(ClientStream stream, std::shared_ptr<OutgoingBytes> outgoing)
        : client(std::move(stream)), held(std::move(outgoing))
    {
    }

    [[nodiscard]] bool HasRoom() const { return gathered.size() <= waitAt; }

    /// A write of the WebSocket itself. Waits for room: a client that pings and never reads must not fill the memory.
    template <class Buffers, class Completion>
    void Gather(const Buffers& buffers, Completion completion)
    {
      if ((!HasRoom() || missing != 0) && !error)
      {
        // The buffers stay valid until the completion is called.
        auto waiting = std::make_shared<Completion>(std::move(completion));
        whenRoomForControl = [this, buffers, waiting] { Gather(buffers, std::move(*waiting)); };
        Flush(shared_from_this());
        return;
      }
      const std::size_t size = error ? 0 : AppendControl(buffers);
      if (inputDrained || gathered.size() >= sendAt)
        FlushSoon(shared_from_this());
      boost::asio::post(client.get_executor(), boost::beast::bind_front_handler(std::move(completion), error, size));
    }

    void Append(std::string_view bytes)
    {
      if (error)
        return;
      gathered += bytes;
      held.Add(bytes.size());
    }

    void AppendTextHead(std::uint64_t size)
    {
      constexpr char finalText = '\x81';
      std::string head{finalText};
      int sizeBytes = 0;
      if (size < 126)
        head += static_cast<char>(size);
      else
      {
        sizeBytes = size <= 0xFFFF ? 2 : 8;
        head += static_cast<char>(sizeBytes == 2 ? 126 : 127);
      }
      for (int shift = 8 * (sizeBytes - 1); shift >= 0; shift -= 8)
        head += static_cast<char>(size >> shift & 0xFF);
      Append(head);
    }

    /// What the WebSocket itself writes, such as a pong. Beast sends a client its close code back, also one that cannot
    /// be: then the client has broken the protocol, and is told so.
    template <class Buffers>
    std::size_t AppendControl(const Buffers& buffers)
    {
      constexpr unsigned firstUnknownCode = 5000;
      std::string frame(boost::asio::buffer_size(buffers), '\0');
      const std::size_t size = boost::asio::buffer_copy(boost::asio::buffer(frame), buffers);
      const auto byte = [&frame](std::size_t i) { return unsigned{static_cast<unsigned char>(frame[i])}; };
      if (size >= 4 && byte(0) == 0x88 && byte(2) * 256 + byte(3) >= firstUnknownCode)
        frame.assign("\x88\x02\x03\xEA", 4); // 1002
      Append(frame);
      return size;
    }

    static void FlushSoon(const std::shared_ptr<State>& state)
    {
      if (!std::exchange(state->flushPosted, true))
        PostFlush(state, mostPostponed);
    }

    /// While more is read, which happens at once where TLS has more than one record at hand, its answers may go out
    /// with what has gathered.
    static void PostFlush(const std::shared_ptr<State>& state, int postpone)
    {
      boost::asio::post(state->client.get_executor(),
                        [state, postpone, reads = state->reads]
                        {
                          if (postpone > 0 && state->reads != reads)
                            return PostFlush(state, postpone - 1);
                          state->flushPosted = false;
                          Flush(state);
                        });
    }

    static void Flush(const std::shared_ptr<State>& state)
    {
      if (state->sending)
      {
        state->flushAgain = true;
        return;
      }
      if (state->gathered.empty())
        return;
      state->sending = true;
      state->flushAgain = false;
      state->sent.swap(state->gathered);
      boost::asio::async_write(state->client, boost::asio::buffer(state->sent),
                               [state](error_code failed, std::size_t) { OnSent(state, failed); });
    }

    static void OnSent(const std::shared_ptr<State>& state, error_code failed)
    {
      state->sending = false;
      state->signOfLife = state->signOfLife || state->sent.size() >= sendAt;
      state->held.Remove(state->sent.size());
      state->sent.clear();
      if (state->sent.capacity() > keptBytes)
        std::string().swap(state->sent);
      if (failed)
      {
        state->error = failed;
        state->missing = 0;
        state->held.Remove(state->gathered.size());
        state->gathered.clear();
      }
      // What has gathered meanwhile keeps gathering unless somebody wants it sent.
      if (state->flushAgain || state->gathered.size() >= sendAt)
        Flush(state);
      // The message that has begun goes on before anything else may stand behind it.
      RunWhenRoom(*state, state->whenRoom);
      if (state->missing == 0)
        RunWhenRoom(*state, state->whenRoomForControl);
      if (!state->sending && state->gathered.empty())
        if (const auto task = std::exchange(state->whenDrained, nullptr))
          task();
    }

    static void RunWhenRoom(State& state, std::function<void()>& waiting)
    {
      if (state.HasRoom())
        if (const auto task = std::exchange(waiting, nullptr))
          task();
    }

    ClientStream client;
    HeldBytes held; // both of the following
    std::string gathered;
    std::string sent;
    std::size_t missing = 0; // of the message that has begun
    bool sending = false;
    bool flushAgain = false;  // Flush was called while sending
    bool flushPosted = false; // FlushSoon has been called
    bool inputDrained = false;
    bool signOfLife = false;
    std::uint64_t reads = 0; // how often more has been asked for
    error_code error;
    std::function<void()> whenRoom;
    std::function<void()> whenRoomForControl; // a write of Beast that waits; it has one at a time
    std::function<void()> whenDrained;        // the end of the stream
    std::chrono::steady_clock::time_point teardownDeadline = std::chrono::steady_clock::time_point::max();
  };

  std::shared_ptr<State> m_state;
};

/// Beast's hook for the end of a WebSocket over this stream.
template <class Handler>
void async_teardown(boost::beast::role_type /*role*/, CoalescingStream& stream, Handler&& handler)
{
  stream.Teardown(std::forward<Handler>(handler));
}

/// Required of a stream; nothing here waits for the end of one.
inline void teardown(boost::beast::role_type /*role*/, CoalescingStream& stream, boost::system::error_code& /*error*/)
{
  stream.next_layer().close();
}

}
