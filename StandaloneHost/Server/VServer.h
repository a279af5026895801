#pragma once

#include "HostInterface/NMX/IAsioPostalService.h"
#include "HostInterface/NMX/VShared.h"
#include "HostInterface/TerminalServer2/IServer.h"
#include "StandaloneHost/Server/Limits.h"

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace Server
{

/// An address that cannot be served; the text is for people.
class ServerError : public std::runtime_error
{
public:
  using std::runtime_error::runtime_error;
};

struct ServerOptions
{
  std::string address = "127.0.0.1"; ///< IPv4 or IPv6 literal
  unsigned short port = 8420;        ///< 0 takes a free one
  TerminalServer2::Level grantedLevel = 2;
  std::string token;                       ///< clients must present it, unless empty
  std::vector<std::string> allowedOrigins; ///< of web pages, beside the server's own
  std::filesystem::path tlsCertificate{};  ///< PEM file; with it and the key, https and wss are served
  std::filesystem::path tlsKey{};          ///< PEM file
  Limits limits;

  [[nodiscard]] bool Encrypted() const { return !tlsCertificate.empty(); }
};

/// What a server has to do.
struct ServerTraffic
{
  std::size_t connections = 0; ///< open now
  std::uint64_t calls = 0;     ///< since it opened
};

/// The standalone host's remote-procedure server: JSON-RPC 2.0 over HTTP and WebSocket on one port. What is registered
/// before Open is served until Close.
class VServer : public TerminalServer2::IServer, public NMX::VShared
{
public:
  VServer(std::shared_ptr<NMX::IAsioPostalService> postal, const ServerOptions& options);

  /// The server has been closed.
  ~VServer() override;

  /// [host] Registration ends when the server opens: `NotAvailable` from then on.
  NMX::IResult RegisterType(TerminalServer2::Level level, const TerminalServer2::TypeRecord& record) override;
  NMX::IResult RegisterCallback(TerminalServer2::Level level, std::shared_ptr<NMX::IServerCallback> callback) override;
  NMX::IResult RegisterFunction(TerminalServer2::Level level, std::shared_ptr<NMX::IServerFunction> function) override;

  /// Starts to serve. Throws ServerError when the address, the certificate or its key cannot be used. [host]
  void Open();

  /// Stops to accept, finishes outstanding calls with `ShuttingDown`, sends what waits and closes the connections, all
  /// within two seconds; then forgets everything that was registered. [host]
  void Close();

  /// Where it is reached, such as "127.0.0.1:8420", "http://127.0.0.1:8420" and "ws://127.0.0.1:8420/rpc". Valid once
  /// it is open.
  [[nodiscard]] const std::string& Address() const;
  [[nodiscard]] std::string Url() const;
  [[nodiscard]] std::string WebSocketUrl() const;
  [[nodiscard]] unsigned short Port() const;

  /// [any]
  [[nodiscard]] ServerTraffic Traffic() const;

private:
  struct State;
  std::shared_ptr<State> m_state;
};

}
