#pragma once

#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/post.hpp>
#include <boost/asio/ssl/context.hpp>
#include <boost/asio/ssl/stream.hpp>

#include <memory>
#include <optional>
#include <string>
#include <utility>

namespace Server
{

/// A TCP socket on a concrete executor: a type-erased one costs at each operation.
using Socket = boost::asio::basic_stream_socket<boost::asio::ip::tcp, boost::asio::io_context::executor_type>;

/// The bytes from and to one client, encrypted or not: one type for both, so that what is built upon it is compiled
/// once. [server]
class ClientStream
{
public:
  using executor_type = boost::asio::io_context::executor_type;
  using error_code = boost::system::error_code;

  /// `peer`: the client's address, for people. With `tls` the stream is of use after the handshake.
  ClientStream(Socket socket, std::string peer, boost::asio::ssl::context* tls)
      : m_parts(std::make_unique<Parts>(std::move(socket), std::move(peer), tls))
  {
  }

  executor_type get_executor() noexcept { return m_parts->socket.get_executor(); }

  [[nodiscard]] bool Encrypted() const { return m_parts->tls.has_value(); }

  /// Agrees on keys with the client. Only for an encrypted stream.
  template <class Handler>
  void async_handshake(Handler&& handler)
  {
    m_parts->tls->async_handshake(boost::asio::ssl::stream_base::server, std::forward<Handler>(handler));
  }

  template <class Buffers, class Handler>
  auto async_read_some(const Buffers& buffers, Handler&& handler)
  {
    if (m_parts->tls)
      return m_parts->tls->async_read_some(buffers, std::forward<Handler>(handler));
    return m_parts->socket.async_read_some(buffers, std::forward<Handler>(handler));
  }

  template <class Buffers, class Handler>
  auto async_write_some(const Buffers& buffers, Handler&& handler)
  {
    if (m_parts->tls)
      return m_parts->tls->async_write_some(buffers, std::forward<Handler>(handler));
    return m_parts->socket.async_write_some(buffers, std::forward<Handler>(handler));
  }

  /// Says that nothing more comes, then reads and drops what the client still sends until it closes too, and calls
  /// `done()`. To close at once would take back the last answer. Nothing is being written; a client that takes too long
  /// is closed by whoever owns the stream, who keeps it until `done`.
  template <class Done>
  void async_end(Done done)
  {
    if (m_parts->tls)
      m_parts->tls->async_shutdown([parts = m_parts.get(), done = std::move(done)](error_code) mutable
                                   { EndPlain(*parts, std::move(done)); });
    else
      EndPlain(*m_parts, std::move(done));
  }

  /// Ends what is being read and written with an error.
  void close()
  {
    error_code ignored;
    (void)m_parts->socket.close(ignored);
  }

  /// The socket beneath, for what may be asked of it and for what is not to be encrypted.
  Socket& Plain() { return m_parts->socket; }

  /// The client's address as text, also when it has gone.
  [[nodiscard]] const std::string& Peer() const { return m_parts->peer; }

private:
  static constexpr std::size_t droppedAtOnce = 16384;

  struct Parts
  {
    Parts(Socket s, std::string p, boost::asio::ssl::context* context) : socket(std::move(s)), peer(std::move(p))
    {
      if (context != nullptr)
        tls.emplace(socket, *context);
    }
    Socket socket;
    std::string peer;
    std::optional<boost::asio::ssl::stream<Socket&>> tls; // refers to the socket, hence stays where it is
    std::string dropped;
  };

  template <class Done>
  static void EndPlain(Parts& parts, Done done)
  {
    error_code ignored;
    (void)parts.socket.shutdown(Socket::shutdown_send, ignored);
    parts.dropped.resize(droppedAtOnce);
    Drop(parts, std::move(done));
  }

  template <class Done>
  static void Drop(Parts& parts, Done done)
  {
    parts.socket.async_read_some(boost::asio::buffer(parts.dropped),
                                 [&parts, done = std::move(done)](error_code error, std::size_t) mutable
                                 {
                                   if (error)
                                     done();
                                   else
                                     Drop(parts, std::move(done));
                                 });
  }

  std::unique_ptr<Parts> m_parts;
};

/// Beast's hook for ending a stream at once.
inline void beast_close_socket(ClientStream& stream)
{
  stream.close();
}

}
