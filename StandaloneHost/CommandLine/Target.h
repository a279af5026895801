#pragma once

#include <chrono>
#include <string>

namespace CommandLine
{

/// The host that a command talks to.
struct Target
{
  bool tls = false;
  std::string host; ///< a name or an address, without brackets
  std::string port;
  std::string token;     ///< empty: none is sent
  std::string authority; ///< file with the certificates that are trusted; empty: those that the system trusts
  std::chrono::milliseconds timeout{10000};

  /// The address as people write it.
  [[nodiscard]] std::string Url() const;

  /// Whether the token can be read by others on its way: it leaves this machine without encryption.
  [[nodiscard]] bool ShowsToken() const;

  /// As in the header "Host".
  [[nodiscard]] std::string HostAndPort() const;
};

/// Takes http(s)://HOST[:PORT] or ws(s)://HOST[:PORT] apart; "/" or "/rpc" may follow. Throws CommandError.
[[nodiscard]] Target ParseServer(const std::string& url);

/// A time in seconds, such as "2" or "0.5". Throws CommandError, which names the option.
[[nodiscard]] std::chrono::milliseconds ParseSeconds(const std::string& text, const std::string& option);

}
