#include "StandaloneHost/CommandLine/Target.h"

#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Layout.h"

#include <boost/regex.hpp>

#include <charconv>

namespace CommandLine
{

std::string Target::HostAndPort() const
{
  const bool bracketed = host.find(':') != std::string::npos;
  return (bracketed ? '[' + host + ']' : host) + ':' + port;
}

std::string Target::Url() const
{
  return (tls ? "https://" : "http://") + HostAndPort();
}

bool Target::ShowsToken() const
{
  const bool here = host == "localhost" || host == "::1" || host.starts_with("127.");
  return !token.empty() && !tls && !here;
}

Target ParseServer(const std::string& url)
{
  static const boost::regex expression(
      R"((http|ws)(s?)://(?:\[([0-9a-f:.]+)\]|([a-z0-9._-]+))(?::([0-9]{1,5}))?(?:/|/rpc)?)", boost::regex::icase);
  boost::smatch match;
  if (!boost::regex_match(url, match, expression))
    throw UsageError("--server: expected an address such as http://127.0.0.1:8420, got " + Quoted(url));
  Target target;
  target.tls = match[2].length() != 0;
  target.host = match[3].matched ? match[3] : match[4];
  target.port = match[5].matched ? match[5].str() : target.tls ? "443" : "80";
  if (std::stoi(target.port) < 1 || std::stoi(target.port) > 65535)
    throw UsageError("--server: expected a port from 1 to 65535, got " + Quoted(target.port));
  return target;
}

std::chrono::milliseconds ParseSeconds(const std::string& text, const std::string& option)
{
  constexpr double longest = 1e7;
  double seconds = 0;
  const auto read = std::from_chars(text.data(), text.data() + text.size(), seconds, std::chars_format::fixed);
  if (read.ec != std::errc{} || read.ptr != text.data() + text.size() || !(seconds >= 0.001 && seconds <= longest))
    throw UsageError("--" + option + ": expected a number of seconds above 0, got " + Quoted(text));
  return std::chrono::milliseconds(static_cast<std::chrono::milliseconds::rep>(seconds * 1000));
}

}
