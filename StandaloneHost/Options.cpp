#include "StandaloneHost/Options.h"

#include "StandaloneHost/ReadyFile.h"
#include "StandaloneHost/Server/TokenFile.h"

#include <boost/asio/ip/address.hpp>
#include <boost/program_options.hpp>
#include <boost/regex.hpp>

#include <cctype>
#include <charconv>
#include <cstdlib>
#include <sstream>
#include <string_view>
#include <utility>

namespace
{

namespace po = boost::program_options;

std::string Quoted(std::string_view text)
{
  return '"' + std::string(text) + '"';
}

/// A whole number, in decimal or after "0x" in hexadecimal.
template <class Number>
Number ParseNumber(std::string_view text, std::string_view option)
{
  std::string_view digits = text;
  const bool hexadecimal = digits.starts_with("0x") || digits.starts_with("0X");
  if (hexadecimal)
    digits.remove_prefix(2);
  Number number{};
  const auto read = std::from_chars(digits.data(), digits.data() + digits.size(), number, hexadecimal ? 16 : 10);
  if (digits.empty() || read.ec != std::errc{} || read.ptr != digits.data() + digits.size())
    throw OptionError("--" + std::string(option) + ": expected a whole number, got " + Quoted(text));
  return number;
}

NMX::ESeverity ParseLogLevel(const std::string& text)
{
  for (int level = static_cast<int>(NMX::ESeverity::Fatal); level <= static_cast<int>(NMX::ESeverity::Trace); ++level)
    if (text == NMX::SeverityName(static_cast<NMX::ESeverity>(level)) || text == std::to_string(level))
      return static_cast<NMX::ESeverity>(level);
  throw OptionError("--log: expected error, warning, notice, info, debug or trace, got " + Quoted(text));
}

/// "ADDRESS:PORT" with an IPv4 address, or "[ADDRESS]:PORT" with an IPv6 one; "localhost" stands for 127.0.0.1.
void ParseListen(const std::string& text, Server::ServerOptions& server)
{
  const auto colon = text.rfind(':');
  if (colon == std::string::npos)
    throw OptionError("--listen: expected ADDRESS:PORT, got " + Quoted(text));
  std::string address = text.substr(0, colon);
  if (address.size() > 2 && address.front() == '[' && address.back() == ']')
    address = address.substr(1, address.size() - 2);
  if (address == "localhost")
    address = "127.0.0.1";
  boost::system::error_code error;
  (void)boost::asio::ip::make_address(address, error);
  if (error)
    throw OptionError("--listen: expected an IP address, got " + Quoted(address));
  server.address = address;
  server.port = ParseNumber<unsigned short>(std::string_view(text).substr(colon + 1), "listen");
}

/// An origin as browsers send it: "scheme://host" or "scheme://host:port", nothing after it.
void CheckOrigin(const std::string& origin)
{
  static const boost::regex expression(R"(https?://([a-z0-9.-]+|\[[0-9a-f:.]+\])(:[0-9]{1,5})?)");
  if (!boost::regex_match(origin, expression))
    throw OptionError(
        "--allow-origin: expected an origin such as https://tools.example:8080, in lower case and without "
        "a path, got " +
        Quoted(origin));
}

std::string ReadToken(const std::filesystem::path& file)
{
  try
  {
    return Server::ReadTokenFile(file);
  }
  catch (const Server::ServerError& failure)
  {
    throw OptionError(std::string("--token-file: ") + failure.what());
  }
}

/// Sets the limits that are given. What is not given follows from what is.
void ReadLimits(const po::variables_map& values, Server::Limits& limits)
{
  for (const Server::LimitRow& row : Server::LimitRows())
  {
    const std::string option(row.option);
    if (values.count(option) == 0)
      continue;
    const auto& text = values[option].as<std::string>();
    const auto number = ParseNumber<std::uint64_t>(text, option);
    if (number < row.smallest || number > row.largest)
      throw OptionError("--" + option + ": expected " + std::to_string(row.smallest) + " to " +
                        std::to_string(row.largest) + ", got " + Quoted(text));
    limits.*row.member = number;
  }
  if (values.count("max-websockets") == 0)
    limits.webSockets = Server::Limits::WebSocketsAmong(limits.connections);
  if (limits.webSockets > limits.connections)
    throw OptionError("--max-websockets: expected at most " + std::to_string(limits.connections) +
                      ", the number of connections, got " + std::to_string(limits.webSockets));
}

/// An option for each limit of the server.
void AddLimits(po::options_description& description)
{
  const Server::Limits usual;
  for (const Server::LimitRow& row : Server::LimitRows())
  {
    std::string text(row.description);
    text.front() = static_cast<char>(std::tolower(static_cast<unsigned char>(text.front())));
    text.back() = ' ';
    text += "(default: " + std::to_string(usual.*row.member) + ")";
    description.add_options()(std::string(row.option).c_str(), po::value<std::string>(), text.c_str());
  }
}

std::filesystem::path UserDataFolder()
{
  const auto variable = [](const char* name) -> std::string
  {
    const char* value = std::getenv(name);
    return value != nullptr ? value : "";
  };
  if (const std::string data = variable("XDG_DATA_HOME"); !data.empty())
    return std::filesystem::path(data) / "subject-store";
  if (const std::string home = variable("HOME"); !home.empty())
    return std::filesystem::path(home) / ".local/share/subject-store";
  throw OptionError("--data: the user has no home folder; name a folder, or :memory:");
}

po::options_description Description()
{
  po::options_description description("subject-store-host [options]   starts a host\n"
                                      "subject-store-host COMMAND …   talks to a host that runs: call, subscribe, "
                                      "describe, completion\n"
                                      "                               (COMMAND --help tells more)\n\nOptions");
  const auto text = [](const char* fallback) { return po::value<std::string>()->default_value(fallback); };
  const auto texts = [] { return po::value<std::vector<std::string>>()->composing(); };
  description.add_options()                                                                     //
      ("help", "show this text and exit")                                                       //
      ("config", texts(), "subject configuration to load when the store is empty (repeatable)") //
      ("data", po::value<std::string>(),
       "folder in which the store is kept, or :memory: to keep nothing (default: the user's data folder)") //
      ("listen", text("127.0.0.1:8420"), "ADDRESS:PORT to serve; port 0 takes a free one")                 //
      ("token-file", po::value<std::string>(),
       "clients must present the token in this file; required unless the address is loopback")                       //
      ("tls-cert", po::value<std::string>(), "PEM file with the certificate: serves https and wss; needs --tls-key") //
      ("tls-key", po::value<std::string>(), "PEM file with the certificate's private key")                           //
      ("allow-origin", texts(), "origin of a web page that may connect (repeatable)")                                //
      ("features", text("0xFFFFFFFF"), "feature mask, decimal or 0x...")                                             //
      ("level", text("2"), "2, or 1 to open the preview functions as well")                                          //
      ("character-calibration-time", text("3000"),
       "how long the calibration of a character takes, in ms")                                     //
      ("t-pose-time", text("60000"), "how long a subject calibration waits for the T-pose, in ms") //
      ("subject-calibration-time", text("10000"),
       "how long a subject calibration goes on after the T-pose, in ms")                           //
      ("headless", "no window; also the case when there is no display")                            //
      ("ready-file", po::value<std::string>(), "file that is there while calls are served")              //
      ("plugin-file", po::value<std::string>(), "plugin module to load (default: the host's own)") //
      ("log", text("notice"), "error, warning, notice, info, debug or trace");
  AddLimits(description);
  return description;
}

}

Request ReadOptions(int argumentCount, const char* const* arguments)
{
  const po::options_description description = Description();
  po::variables_map values;
  try
  {
    po::store(po::command_line_parser(argumentCount, arguments)
                  .options(description)
                  .positional(po::positional_options_description())
                  .style(po::command_line_style::unix_style & ~po::command_line_style::allow_guessing)
                  .run(),
              values);
    po::notify(values);
  }
  catch (const po::error& failure)
  {
    throw OptionError(std::string(failure.what()) + "; --help lists the options");
  }

  Request request;
  if (values.count("help") != 0)
  {
    request.help = true;
    std::ostringstream text;
    text << description;
    request.helpText = text.str();
    return request;
  }
  const auto given = [&](const char* name) -> std::string
  { return values.count(name) != 0 ? values[name].as<std::string>() : std::string{}; };
  const auto list = [&](const char* name)
  { return values.count(name) != 0 ? values[name].as<std::vector<std::string>>() : std::vector<std::string>{}; };

  Options& options = request.options;
  for (const std::string& file : list("config"))
    options.configurations.emplace_back(file);
  if (const std::string data = given("data"); data.empty())
    options.dataFolder = UserDataFolder();
  else if (data != ":memory:")
    options.dataFolder = data;
  ParseListen(given("listen"), options.server);
  if (values.count("token-file") != 0)
    options.server.token = ReadToken(given("token-file"));
  if (options.server.token.empty() && !boost::asio::ip::make_address(options.server.address).is_loopback())
    throw OptionError("--listen: " + options.server.address +
                      " can be reached from other machines, so a token is "
                      "required: --token-file FILE");
  options.server.tlsCertificate = given("tls-cert");
  options.server.tlsKey = given("tls-key");
  if (options.server.tlsCertificate.empty() != options.server.tlsKey.empty())
    throw OptionError("--tls-cert and --tls-key: one needs the other");
  ReadLimits(values, options.server.limits);
  options.server.allowedOrigins = list("allow-origin");
  for (const std::string& origin : options.server.allowedOrigins)
    CheckOrigin(origin);
  options.features = ParseNumber<std::uint32_t>(given("features"), "features");
  options.server.grantedLevel = ParseNumber<std::uint32_t>(given("level"), "level");
  if (options.server.grantedLevel != 1 && options.server.grantedLevel != 2)
    throw OptionError("--level: expected 1 or 2, got " + Quoted(given("level")));
  const auto time = [&](const char* name)
  { return std::chrono::milliseconds(ParseNumber<std::uint32_t>(given(name), name)); };
  options.characterCalibrationTime = time("character-calibration-time");
  options.subjectCalibrationTimes = {time("t-pose-time"), time("subject-calibration-time")};
  options.headless = values.count("headless") != 0;
  options.readyFile = given("ready-file");
  options.pluginFile = given("plugin-file");
  options.logLevel = ParseLogLevel(given("log"));
  CheckReadyFile(options, given("token-file"));
  return request;
}
