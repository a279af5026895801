// A client of the server, from its first byte or after a valid upgrade: whatever it sends, the server goes on, what it
// answers conforms, and nothing of the connection stays.
//
// The first byte of the input: 1 begins after an upgrade, 2 cuts what follows into pieces of one to eight bytes, 16
// ends with a reset in place of an orderly end.

#include "HostInterface/NotificationSystem/VMultiCallbackPostal.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VServerCallback.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VServerFunction.h"
#include "StandaloneHost/Server/VServer.h"
#include "tests/Support/ManualAsioPostal.h"

#include <boost/json/parse.hpp>

#include <arpa/inet.h>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <string>
#include <sys/socket.h>
#include <unistd.h>

using namespace TerminalServer2;

namespace
{

constexpr std::size_t answerBytes = std::size_t{16} << 20; // far more than inputs of a few thousand bytes ask for

constexpr std::string_view upgrade =
    "GET /rpc HTTP/1.1\r\nHost: 127.0.0.1\r\nConnection: Upgrade\r\nUpgrade: websocket\r\n"
    "Sec-WebSocket-Key: dGhlIHNhbXBsZSBub25jZQ==\r\nSec-WebSocket-Version: 13\r\n\r\n";

[[noreturn]] void Fail(const char* what)
{
  std::fprintf(stderr, "websocket: %s\n", what);
  std::abort();
}

void Expect(bool holds, const char* what)
{
  if (!holds)
    Fail(what);
}

/// A server with a small group of its own, whose tasks run when the target says so. It is never closed: that would need
/// another thread.
struct Stage
{
  Stage()
  {
    static constexpr ArgumentText value[] = {{"Name", ""}, {"Enabled", ""}, {"Size", ""}};
    static constexpr ArgumentText names[] = {{"Name", ""}, {"Names", ""}};
    static constexpr ArgumentText able[] = {{"Able", ""}};
    Add<NMX::IResult(const std::string&, bool, double)>({"Group.Set", "", value, "Ok - On success."},
                                                        [this](const std::string& name, bool enabled, double)
                                                        {
                                                          changed->Fire();
                                                          ableChanged->Fire(enabled);
                                                          return name.empty() ? NMX::EResult::NotFound
                                                                              : NMX::EResult::Ok;
                                                        });
    Add<NMX::IResult(const std::string&, std::vector<std::string>&)>(
        {"Group.Names", "", names, "Ok - On success."},
        [](const std::string& name, std::vector<std::string>& all) -> NMX::IResult
        {
          all.assign(3, name);
          return NMX::EResult::Ok;
        });
    AddCallback({"Group.ChangedCallback", "", {}, ""}, changed);
    AddCallback({"Group.AbleCallback", "", able, ""}, ableChanged);
    server->Open();
  }

  template <class Signature, class Callable>
  void Add(const FunctionRecord& record, Callable callable)
  {
    (void)server->RegisterFunction(
        2, NMX::MakeShared<VServerFunction<Signature>>(record, callable, std::make_shared<CallQueue>(postal)));
  }

  template <class Signature>
  void AddCallback(const FunctionRecord& record,
                   const std::shared_ptr<NotificationSystem::VMultiCallbackPostal<Signature>>& multiCallback)
  {
    using Callback = VServerCallback<Signature, NMX::IMultiCallbackPostal<Signature>>;
    (void)server->RegisterCallback(2, NMX::MakeShared<Callback>(record, multiCallback, postal));
  }

  static Server::ServerOptions Options()
  {
    Server::ServerOptions options;
    options.port = 0;
    options.limits.messageBytes = 4096;
    options.limits.outgoingBytes = std::size_t{96} << 10; // a batch of descriptions comes to more
    return options;
  }

  std::shared_ptr<ManualAsioPostal> postal = std::make_shared<ManualAsioPostal>();
  std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void()>> changed =
      NMX::MakeShared<NotificationSystem::VMultiCallbackPostal<void()>>();
  std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void(bool)>> ableChanged =
      NMX::MakeShared<NotificationSystem::VMultiCallbackPostal<void(bool)>>();
  std::shared_ptr<Server::VServer> server = NMX::MakeShared<Server::VServer>(postal, Options());
};

/// The client: sends, and keeps what it is sent.
class Client
{
public:
  explicit Client(Stage& stage) : m_stage(stage), m_socket(socket(AF_INET, SOCK_STREAM | SOCK_NONBLOCK, 0))
  {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(stage.server->Port());
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    const int connected = connect(m_socket, reinterpret_cast<const sockaddr*>(&address), sizeof address);
    Expect(m_socket >= 0 && (connected == 0 || errno == EINPROGRESS), "no connection");
    Run();
  }

  ~Client() { close(m_socket); }

  void Send(std::string_view bytes)
  {
    while (!bytes.empty())
    {
      const ssize_t sent = send(m_socket, bytes.data(), bytes.size(), MSG_NOSIGNAL);
      Run();
      if (sent < 0 && errno != EAGAIN)
        return; // the server has ended the connection
      bytes.remove_prefix(sent > 0 ? static_cast<std::size_t>(sent) : 0);
    }
  }

  /// Lets the server work until it has nothing to do, and reads what it sent.
  void Run()
  {
    for (bool more = true; more;)
    {
      m_stage.postal->context.restart();
      more = m_stage.postal->context.poll() != 0;
      char buffer[65536];
      for (ssize_t size = 0; (size = recv(m_socket, buffer, sizeof buffer, 0)) > 0; more = true)
        m_received.append(buffer, static_cast<std::size_t>(size));
      Expect(m_received.size() < answerBytes, "too much is answered");
    }
  }

  /// Ends the connection; soon the server must have forgotten it.
  void End(bool reset)
  {
    const linger abrupt{1, 0}; // also spares the system a port that waits
    if (!reset)
    {
      shutdown(m_socket, SHUT_WR);
      Run();
    }
    setsockopt(m_socket, SOL_SOCKET, SO_LINGER, &abrupt, sizeof abrupt);
    close(std::exchange(m_socket, -1));
    for (int attempt = 0; m_stage.server->Traffic().connections != 0; ++attempt)
    {
      Expect(attempt < 1000, "the connection does not end");
      m_stage.postal->context.restart();
      if (m_stage.postal->context.poll() == 0)
        usleep(100);
    }
  }

  [[nodiscard]] const std::string& Received() const { return m_received; }

private:
  Stage& m_stage;
  int m_socket;
  std::string m_received;
};

/// A frame of the server: final, not masked, its length in the fewest bytes; a text is JSON; nothing follows a goodbye.
void ExpectFrames(std::string_view bytes)
{
  bool closed = false;
  while (bytes.size() >= 2)
  {
    const auto first = static_cast<unsigned char>(bytes[0]);
    std::size_t size = static_cast<unsigned char>(bytes[1]);
    std::size_t head = 2;
    Expect(size < 0x80, "a masked frame");
    if (const std::size_t wide = size == 127 ? 8 : size == 126 ? 2 : 0; wide != 0)
    {
      if (bytes.size() < 2 + wide)
        return;
      size = 0;
      for (; head < 2 + wide; ++head)
        size = size << 8 | static_cast<unsigned char>(bytes[head]);
      Expect(size > (wide == 2 ? 125U : 0xFFFFU), "a length in too many bytes");
    }
    if (bytes.size() < head + size)
      return; // the end of the connection cut it off
    const std::string_view payload = bytes.substr(head, size);
    Expect(!closed, "a frame after the close frame");
    boost::system::error_code error;
    if (first == 0x81)
      (void)boost::json::parse({payload.data(), payload.size()}, error);
    else
      Expect((first == 0x88 || first == 0x8A) && size < 126, "a frame of another kind");
    Expect(!error, "a text that is not JSON");
    closed = first == 0x88;
    bytes.remove_prefix(head + size);
  }
}

}

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size)
{
  static Stage& stage = *new Stage;
  if (size == 0)
    return 0;
  const unsigned mode = data[0];
  std::string_view input(reinterpret_cast<const char*>(data + 1), size - 1);
  Client client(stage);
  if ((mode & 1) != 0)
    client.Send(upgrade);
  const std::size_t piece = (mode & 2) != 0 ? 1 + (mode >> 5) : input.size();
  for (; !input.empty(); input.remove_prefix(std::min(piece, input.size())))
    client.Send(input.substr(0, piece));
  client.End((mode & 16) != 0);

  const std::string& received = client.Received();
  if (received.empty())
    return 0;
  Expect(received.starts_with("HTTP/1.1 "), "no HTTP answer");
  if (received.starts_with("HTTP/1.1 101 "))
    ExpectFrames(std::string_view(received).substr(received.find("\r\n\r\n") + 4));
  else
    Expect((mode & 1) == 0, "the upgrade was refused");
  return 0;
}
