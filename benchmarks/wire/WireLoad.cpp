// A load client for JSON-RPC over WebSocket: keeps a number of calls in flight on a number of connections for a while,
// and tells the calls per second, the latency, and the processor time that the server took for each call.
//
// It makes its frames by hand and reads with one system call whatever has come, so that it costs less than any server
// that it measures. It talks to 127.0.0.1 only.

#include <boost/asio.hpp>
#include <boost/asio/ssl.hpp>
#include <boost/program_options.hpp>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <memory>
#include <sstream>
#include <string>
#include <type_traits>
#include <vector>

namespace
{

namespace asio = boost::asio;
namespace po = boost::program_options;
using Clock = std::chrono::steady_clock;
using Socket = asio::basic_stream_socket<asio::ip::tcp, asio::io_context::executor_type>;
using TlsStream = asio::ssl::stream<Socket>;

/// Processor time of a process so far, in seconds.
double ProcessorTime(int pid)
{
  std::ifstream in("/proc/" + std::to_string(pid) + "/stat");
  std::string text((std::istreambuf_iterator<char>(in)), {});
  std::istringstream fields(text.substr(text.rfind(')') + 2));
  std::string skipped;
  for (int field = 3; field < 14; ++field)
    fields >> skipped;
  double user = 0;
  double system = 0;
  fields >> user >> system;
  return (user + system) / static_cast<double>(sysconf(_SC_CLK_TCK));
}

/// A masked text frame; the mask is zero, which leaves the text as it is.
std::string Frame(const std::string& text)
{
  std::string frame = "\x81";
  if (text.size() < 126)
    frame += static_cast<char>(0x80 | text.size());
  else
  {
    frame += static_cast<char>(0x80 | 126);
    frame += static_cast<char>(text.size() >> 8);
    frame += static_cast<char>(text.size() & 0xFF);
  }
  frame.append(4, '\0');
  return frame + text;
}

struct Totals
{
  std::uint64_t calls = 0;
  std::vector<float> latencies; // µs
  bool measuring = false;
};

struct Plan
{
  asio::ip::tcp::endpoint endpoint;
  std::string path;
  std::string fields; // more lines for the head of the upgrade, each with its end
  std::string frame;
  std::size_t connections;
  std::size_t inFlight;
};

template <class Stream>
class Connection
{
public:
  Connection(Stream stream, std::string frame, Totals& totals)
      : m_stream(std::move(stream)), m_frame(std::move(frame)), m_totals(totals)
  {
  }

  void Open(const Plan& plan)
  {
    m_stream.lowest_layer().connect(plan.endpoint);
    m_stream.lowest_layer().set_option(asio::ip::tcp::no_delay(true));
    if constexpr (std::is_same_v<Stream, TlsStream>)
      m_stream.handshake(TlsStream::client);
    const std::string request = "GET " + plan.path +
                                " HTTP/1.1\r\nHost: 127.0.0.1:" + std::to_string(plan.endpoint.port()) + "\r\n" +
                                plan.fields +
                                "Upgrade: websocket\r\nConnection: Upgrade\r\n"
                                "Sec-WebSocket-Key: dGhlIHNhbXBsZSBub25jZQ==\r\nSec-WebSocket-Version: 13\r\n\r\n";
    asio::write(m_stream, asio::buffer(request));
    std::string response;
    asio::read_until(m_stream, asio::dynamic_buffer(response), "\r\n\r\n");
    if (response.compare(9, 3, "101") != 0)
      throw std::runtime_error("no WebSocket: " + response);
    m_input = response.substr(response.find("\r\n\r\n") + 4);
  }

  void Start(std::size_t inFlight)
  {
    m_sent.assign(inFlight, Clock::now());
    Send(inFlight);
    Read();
  }

private:
  void Send(std::size_t count)
  {
    std::string frames;
    for (std::size_t i = 0; i < count; ++i)
      frames += m_frame;
    asio::write(m_stream, asio::buffer(frames));
  }

  void Read()
  {
    m_stream.async_read_some(asio::buffer(m_buffer),
                             [this](boost::system::error_code error, std::size_t size)
                             {
                               if (error)
                                 return;
                               m_input.append(m_buffer.data(), size);
                               const std::size_t answered = Take();
                               if (answered != 0)
                                 Send(answered);
                               Read();
                             });
  }

  /// Takes in whole frames; returns how many calls were answered.
  std::size_t Take()
  {
    std::size_t answered = 0;
    std::size_t place = 0;
    const auto now = Clock::now();
    while (m_input.size() - place >= 4)
    {
      const auto byte = [&](std::size_t offset) { return static_cast<unsigned char>(m_input[place + offset]); };
      std::size_t size = byte(1);
      std::size_t head = 2;
      if (size == 126)
      {
        size = static_cast<std::size_t>(byte(2)) << 8 | byte(3);
        head = 4;
      }
      if (m_input.size() - place < head + size)
        break;
      const std::string_view text(m_input.data() + place + head, size);
      if (text.find("\"error\"") != std::string_view::npos)
        throw std::runtime_error("a call failed: " + std::string(text));
      if (text.find("\"id\"") != std::string_view::npos)
      {
        // Answers come in the order of the calls.
        if (m_totals.measuring)
        {
          ++m_totals.calls;
          m_totals.latencies.push_back(std::chrono::duration<float, std::micro>(now - m_sent[m_oldest]).count());
        }
        m_sent[m_oldest] = now;
        m_oldest = (m_oldest + 1) % m_sent.size();
        ++answered;
      }
      place += head + size;
    }
    m_input.erase(0, place);
    return answered;
  }

  Stream m_stream;
  const std::string m_frame;
  Totals& m_totals;
  std::string m_input;
  std::array<char, 65536> m_buffer;
  std::vector<Clock::time_point> m_sent;
  std::size_t m_oldest = 0;
};

/// Opens the connections and begins to send.
template <class Stream, class Make>
std::vector<std::unique_ptr<Connection<Stream>>> Begin(const Plan& plan, Totals& totals, Make make)
{
  std::vector<std::unique_ptr<Connection<Stream>>> connections;
  for (std::size_t i = 0; i < plan.connections; ++i)
  {
    connections.push_back(std::make_unique<Connection<Stream>>(make(), plan.frame, totals));
    connections.back()->Open(plan);
  }
  for (auto& connection : connections)
    connection->Start(plan.inFlight);
  return connections;
}

}

int main(int argumentCount, char** arguments)
{
  try
  {
    po::options_description description("wire-load");
    description.add_options()("port", po::value<unsigned short>()->required(), "port on 127.0.0.1") //
        ("pid", po::value<int>()->required(), "process of the server")                              //
        ("path", po::value<std::string>()->default_value("/rpc"), "path of the WebSocket")          //
        ("request", po::value<std::string>()->required(), "text of one call")                       //
        ("token", po::value<std::string>(), "token that the server asks for")                       //
        ("tls", "encrypt")                                                                          //
        ("connections", po::value<std::size_t>()->default_value(8), "connections")                  //
        ("in-flight", po::value<std::size_t>()->default_value(16), "calls in flight on each")       //
        ("seconds", po::value<double>()->default_value(5), "how long to measure");
    po::variables_map values;
    po::store(po::parse_command_line(argumentCount, arguments, description), values);
    po::notify(values);

    asio::io_context context(1);
    Totals totals;
    totals.latencies.reserve(4U << 20);
    const Plan plan{{asio::ip::address_v4::loopback(), values["port"].as<unsigned short>()},
                    values["path"].as<std::string>(),
                    values.count("token") != 0 ? "Authorization: Bearer " + values["token"].as<std::string>() + "\r\n"
                                               : "",
                    Frame(values["request"].as<std::string>()),
                    values["connections"].as<std::size_t>(),
                    values["in-flight"].as<std::size_t>()};
    asio::ssl::context tls(asio::ssl::context::tls_client); // the server is known by its port
    std::vector<std::unique_ptr<Connection<Socket>>> plain;
    std::vector<std::unique_ptr<Connection<TlsStream>>> encrypted;
    if (values.count("tls") != 0)
      encrypted = Begin<TlsStream>(plan, totals, [&] { return TlsStream(Socket(context.get_executor()), tls); });
    else
      plain = Begin<Socket>(plan, totals, [&] { return Socket(context.get_executor()); });

    context.run_for(std::chrono::seconds(1)); // warms up
    const int pid = values["pid"].as<int>();
    totals.measuring = true;
    const auto start = Clock::now();
    const double processorStart = ProcessorTime(pid);
    context.run_for(std::chrono::duration_cast<std::chrono::nanoseconds>(
        std::chrono::duration<double>(values["seconds"].as<double>())));
    const double elapsed = std::chrono::duration<double>(Clock::now() - start).count();
    const double processor = ProcessorTime(pid) - processorStart;

    std::sort(totals.latencies.begin(), totals.latencies.end());
    const auto quantile = [&](double q)
    {
      return totals.latencies.empty()
                 ? 0.0F
                 : totals.latencies[static_cast<std::size_t>(q * static_cast<double>(totals.latencies.size() - 1))];
    };
    const auto calls = static_cast<double>(totals.calls);
    std::printf("{\"callsPerSecond\": %.0f, \"processorMicrosecondsPerCall\": %.2f, \"latencyMicroseconds\": "
                "{\"p50\": %.0f, \"p99\": %.0f, \"max\": %.0f}}\n",
                calls / elapsed, processor / calls * 1e6, static_cast<double>(quantile(0.5)),
                static_cast<double>(quantile(0.99)), static_cast<double>(quantile(1)));
    return totals.calls > 0 ? 0 : 1;
  }
  catch (const std::exception& failure)
  {
    std::fprintf(stderr, "wire-load: %s\n", failure.what());
    return 1;
  }
}
