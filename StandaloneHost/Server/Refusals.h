#pragma once

#include <array>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

namespace Server
{

/// Why a client, or what it asks for, is turned away.
enum class ERefusal
{
  NoToken,
  WrongOrigin,
  WrongHost,
  TooManyConnections,
  Displaced,      ///< an idle connection, to make room for another
  BadRequest,     ///< what is not HTTP, or too long
  BadHandshake,   ///< TLS or WebSocket
  BrokenProtocol, ///< a WebSocket client that breaks its protocol or a limit
  SlowReader,
  Silent,     ///< does not answer pings
  Overdue,    ///< takes too long over its request, or to close
  NotAccepted ///< the system has no more sockets
};

/// Tells the log of refusals, a line each; where there are many of a kind, the first, and from time to time how many
/// have followed, so that nobody can fill the log. [server]
class Refusals
{
public:
  using Clock = std::chrono::steady_clock;
  using Tell = std::function<void(const std::string& line)>;

  /// Lines go to the server's log channel unless `tell` is given.
  explicit Refusals(Tell tell = {});

  /// `detail` is for people; it may hold whatever a client has sent.
  void Note(ERefusal kind, std::string_view peer, std::string_view detail, Clock::time_point now = Clock::now());

  /// Tells what has been held back for long enough; to be called from time to time.
  void Tick(Clock::time_point now);

private:
  struct Kind
  {
    Clock::time_point lastTold;
    std::uint64_t heldBack = 0;
    bool told = false;
  };

  static constexpr std::size_t kinds = static_cast<std::size_t>(ERefusal::NotAccepted) + 1;

  Tell m_tell;
  std::array<Kind, kinds> m_kinds;
};

}
