#include "StandaloneHost/Server/VServer.h"

#include "HostInterface/DebugServices/CallAssertFailHandler.h"
#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Page/Page.h"
#include "StandaloneHost/Server/Core.h"
#include "StandaloneHost/Server/HttpSession.h"
#include "StandaloneHost/Server/TlsContext.h"

#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/post.hpp>
#include <boost/asio/steady_timer.hpp>

#include <fstream>
#include <future>
#include <optional>
#include <random>
#include <sys/resource.h>
#include <utility>

namespace Server
{

namespace asio = boost::asio;
using Tcp = asio::ip::tcp;
using Acceptor = asio::basic_socket_acceptor<Tcp, asio::io_context::executor_type>;
using Clock = std::chrono::steady_clock;
using boost::system::error_code;
using NMX::EResult;
using NMX::IResult;

namespace
{

constexpr auto tick = std::chrono::milliseconds(500);
constexpr auto closingTick = std::chrono::milliseconds(10);
constexpr auto closingTime = std::chrono::milliseconds(1500);
constexpr auto acceptPause = std::chrono::milliseconds(100);
constexpr auto standstill = 4 * tick;     // so late, and the process has not run meanwhile
constexpr std::size_t refusedAtOnce = 64; // connections beyond the limit that are told so
constexpr rlim_t otherFiles = 256;        // what the host needs besides connections

/// Lets the process have as many open files as it has connections, if the system allows it.
void AllowOpenFiles(std::size_t connections)
{
  rlimit limit{};
  if (getrlimit(RLIMIT_NOFILE, &limit) != 0 || limit.rlim_cur >= connections + otherFiles)
    return;
  limit.rlim_cur = std::min<rlim_t>(limit.rlim_max, connections + otherFiles);
  if (setrlimit(RLIMIT_NOFILE, &limit) != 0 || limit.rlim_cur < connections + otherFiles)
    NMX::Log(NMX::serverLog, NMX::ESeverity::Notice,
             "The system allows %1% open files: less than %2% clients can connect at once.", limit.rlim_cur,
             connections);
}

std::unique_ptr<asio::ssl::context> TlsFor(const ServerOptions& options)
{
  return options.Encrypted() ? MakeTlsContext(options.tlsCertificate, options.tlsKey) : nullptr;
}

/// A text that no other start of a host has.
std::string NewEpoch()
{
  static constexpr std::string_view digits = "0123456789abcdef";
  std::random_device random;
  std::string epoch;
  for (int i = 0; i < 4; ++i)
    for (unsigned word = random(), digit = 0; digit < 8; ++digit, word >>= 4)
      epoch += digits[word & 0xF];
  return epoch;
}

}

/// What runs on the server's thread. Handlers hold it weakly: whatever owns the context must not be held by it.
struct VServer::State : std::enable_shared_from_this<State>
{
  State(std::shared_ptr<NMX::IAsioPostalService> service, const ServerOptions& options)
      : postal(std::move(service)), core(std::make_shared<Core>(options, NewEpoch())),
        acceptor(postal->Context().get_executor()), timer(postal->Context())
  {
  }

  /// Everything has been registered.
  void AddDocuments() const
  {
    for (const Page::File& file : Page::Files())
      core->documents.Add({file.target, file.type, std::make_shared<const std::string>(file.content), true});
    core->documents.Add({"/openrpc.json", "application/json", core->dispatcher.Api().functions});
    core->documents.Add({"/asyncapi.json", "application/json", core->dispatcher.Api().events});
  }

  void Accept()
  {
    acceptor.async_accept(peer,
                          [weak = weak_from_this()](error_code error, Socket socket)
                          {
                            if (const auto self = weak.lock(); self && self->acceptor.is_open())
                              self->OnAccepted(error, std::move(socket));
                          });
  }

  void OnAccepted(error_code error, Socket socket)
  {
    if (error)
      return OnNotAccepted(error);
    error_code ignored;
    (void)socket.set_option(Tcp::no_delay(true), ignored);
    std::string client = peer.address().to_string();
    const std::size_t count = core->connections.Count();
    if (count < core->options.limits.connections || MakeRoom())
      StartHttp(std::move(socket), std::move(client), core);
    else
    {
      core->refusals.Note(ERefusal::TooManyConnections, client, {});
      if (count < core->options.limits.connections + refusedAtOnce)
        RefuseHttp(std::move(socket), std::move(client), core);
    }
    Accept();
  }

  /// Most likely there are too many open files. Newcomers would wait in vain until somebody leaves: room is made for
  /// them, or each is told by the end of its connection, for which a file is kept open.
  void OnNotAccepted(error_code error)
  {
    core->refusals.Note(ERefusal::NotAccepted, {}, error.message());
    const bool tooMany =
        error == asio::error::no_descriptors || error == boost::system::errc::too_many_files_open_in_system;
    if (tooMany && MakeRoom())
      return Accept();
    if (tooMany && spare)
      TurnAway();
    acceptTimer.expires_after(acceptPause);
    acceptTimer.async_wait(
        [weak = weak_from_this()](error_code cancelled)
        {
          if (const auto self = weak.lock(); self && !cancelled && self->acceptor.is_open())
            self->Accept();
        });
  }

  void TurnAway()
  {
    spare.reset();
    error_code ignored;
    acceptor.non_blocking(true, ignored);
    error_code failed;
    for (std::size_t i = 0; i < refusedAtOnce && !failed; ++i)
    {
      Socket socket(postal->Context().get_executor());
      acceptor.accept(socket, failed);
    }
    KeepSpareFile();
  }

  void KeepSpareFile()
  {
    spare.emplace("/dev/null");
    if (!spare->is_open())
      spare.reset();
  }

  /// Ends a connection for a newcomer: those who open many and do nothing with them, or send and read a little at a
  /// time, keep nobody out.
  bool MakeRoom() const
  {
    IConnection* first = core->connections.FirstToEnd(Clock::now());
    if (first == nullptr)
      return false;
    core->refusals.Note(ERefusal::Displaced, first->Peer(), {});
    first->Abort();
    return true;
  }

  /// Ends the connections that wait for too long: one coarse timer for all.
  void Tick()
  {
    timer.expires_after(tick);
    timer.async_wait(
        [weak = weak_from_this()](error_code cancelled)
        {
          const auto self = weak.lock();
          if (!self || cancelled || self->core->closing)
            return;
          self->OnTick(Clock::now());
          self->Tick();
        });
  }

  void OnTick(Clock::time_point now)
  {
    const auto pause = now - std::exchange(lastTick, now) - tick;
    // Whoever was stopped has not read what clients have sent meanwhile: it is read before anybody is judged.
    if (pause > standstill)
      core->connections.ForEach([pause](IConnection& connection) { connection.Extend(pause); });
    else
      core->connections.ForEach([now](IConnection& connection) { connection.Tick(now); });
    core->refusals.Tick(now);
  }

  void BeginClose(std::shared_ptr<std::promise<void>> done)
  {
    core->closing = true;
    error_code ignored;
    (void)acceptor.close(ignored);
    acceptTimer.cancel();
    timer.cancel();
    FinishCalls();
    core->connections.ForEach([](IConnection& connection) { connection.Close(); });
    AwaitClosed(Clock::now() + closingTime, std::move(done));
  }

  void FinishCalls()
  {
    for (const FunctionEntry& entry : core->registry.Functions())
      entry.function->FinishOutstanding(EResult::ShuttingDown);
  }

  void AwaitClosed(Clock::time_point deadline, std::shared_ptr<std::promise<void>> done)
  {
    if (core->connections.Count() == 0 || Clock::now() > deadline)
    {
      core->connections.ForEach([](IConnection& connection) { connection.Abort(); });
      FinishCalls(); // those that came in with the last requests
      core->notifier.Close();
      core->registry.Clear();
      done->set_value();
      return;
    }
    timer.expires_after(closingTick);
    timer.async_wait([self = shared_from_this(), deadline, done = std::move(done)](error_code) mutable
                     { self->AwaitClosed(deadline, std::move(done)); });
  }

  const std::shared_ptr<NMX::IAsioPostalService> postal;
  const std::shared_ptr<Core> core;
  Acceptor acceptor;
  Tcp::endpoint peer; // of the connection that is being accepted
  std::optional<std::ifstream> spare;
  asio::steady_timer timer;
  Clock::time_point lastTick = Clock::now();
  asio::steady_timer acceptTimer{postal->Context()};
  std::string address;
  unsigned short port = 0;
  bool open = false; // on the host's thread
};

VServer::VServer(std::shared_ptr<NMX::IAsioPostalService> postal, const ServerOptions& options)
    : m_state(std::make_shared<State>(std::move(postal), options))
{
}

VServer::~VServer()
{
  if (m_state->open)
    DebugServices::CallAssertFailHandler("the server was closed", __FILE__, __LINE__);
}

IResult VServer::RegisterType(TerminalServer2::Level level, const TerminalServer2::TypeRecord& record)
{
  return m_state->open ? EResult::NotAvailable : m_state->core->registry.Add(level, record);
}

IResult VServer::RegisterCallback(TerminalServer2::Level level, std::shared_ptr<NMX::IServerCallback> callback)
{
  return m_state->open ? EResult::NotAvailable : m_state->core->registry.Add(level, std::move(callback));
}

IResult VServer::RegisterFunction(TerminalServer2::Level level, std::shared_ptr<NMX::IServerFunction> function)
{
  return m_state->open ? EResult::NotAvailable : m_state->core->registry.Add(level, std::move(function));
}

void VServer::Open()
{
  const ServerOptions& options = m_state->core->options;
  const std::string where = options.address + ':' + std::to_string(options.port);
  m_state->core->tls = TlsFor(options);
  try
  {
    const Tcp::endpoint endpoint(asio::ip::make_address(options.address), options.port);
    m_state->acceptor.open(endpoint.protocol());
    m_state->acceptor.set_option(Acceptor::reuse_address(true));
    m_state->acceptor.bind(endpoint);
    m_state->acceptor.listen();
    m_state->port = m_state->acceptor.local_endpoint().port();
  }
  catch (const boost::system::system_error& failure)
  {
    throw ServerError("cannot serve " + where + ": " + failure.code().message());
  }
  const bool isV6 = options.address.find(':') != std::string::npos;
  m_state->address = (isV6 ? '[' + options.address + ']' : options.address) + ':' + std::to_string(m_state->port);
  if (!options.Encrypted() && !asio::ip::make_address(options.address).is_loopback())
    NMX::Log(NMX::serverLog, NMX::ESeverity::Warning,
             "Everybody on the network can read the token and all that is said: %1%",
             "--tls-cert and --tls-key encrypt it.");
  AllowOpenFiles(options.limits.connections);
  m_state->AddDocuments();
  m_state->open = true;
  asio::post(m_state->postal->Context(),
             [state = m_state]
             {
               state->KeepSpareFile();
               state->lastTick = Clock::now();
               state->Accept();
               state->Tick();
             });
}

void VServer::Close()
{
  if (!m_state->open)
  {
    m_state->core->registry.Clear();
    return;
  }
  const auto done = std::make_shared<std::promise<void>>();
  auto closed = done->get_future();
  asio::post(m_state->postal->Context(), [state = m_state, done] { state->BeginClose(done); });
  closed.wait();
  m_state->open = false;
}

const std::string& VServer::Address() const
{
  return m_state->address;
}

std::string VServer::Url() const
{
  return (m_state->core->tls ? "https://" : "http://") + m_state->address;
}

std::string VServer::WebSocketUrl() const
{
  return (m_state->core->tls ? "wss://" : "ws://") + m_state->address + "/rpc";
}

unsigned short VServer::Port() const
{
  return m_state->port;
}

ServerTraffic VServer::Traffic() const
{
  return {m_state->core->connections.Count(), m_state->core->dispatcher.Calls()};
}

}
