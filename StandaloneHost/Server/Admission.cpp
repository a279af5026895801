#include "StandaloneHost/Server/Admission.h"

#include <boost/asio/ip/address.hpp>

#include <algorithm>
#include <string>

namespace Server
{

namespace
{

/// Compares in a time that does not tell how much of the text is right.
bool SameSecret(std::string_view given, std::string_view secret)
{
  unsigned difference = given.size() == secret.size() ? 0 : 1;
  for (std::size_t i = 0; i < given.size(); ++i)
    difference |= static_cast<unsigned char>(given[i]) ^ static_cast<unsigned char>(secret[i % secret.size()]);
  return difference == 0;
}

/// The host of "host:port" or "[address]:port".
std::string HostName(std::string_view host)
{
  if (host.starts_with('['))
    return std::string(host.substr(1, host.find(']') - 1));
  return std::string(host.substr(0, host.rfind(':')));
}

/// A name can be made to point anywhere; an address cannot, and "localhost" does not.
bool IsOwnHost(std::string_view host)
{
  const std::string name = HostName(host);
  boost::system::error_code error;
  (void)boost::asio::ip::make_address(name, error);
  return !error || name == "localhost";
}

bool IsOwnOrigin(std::string_view origin, std::string_view host)
{
  return origin == "http://" + std::string(host);
}

}

EAdmission Admit(const Visitor& visitor, const ServerOptions& options)
{
  constexpr std::string_view scheme = "Bearer ";
  if (!options.token.empty() && !visitor.preflight &&
      (!visitor.authorisation.starts_with(scheme) ||
       !SameSecret(visitor.authorisation.substr(scheme.size()), options.token)))
    return EAdmission::NoToken;
  if (options.token.empty() && !visitor.host.empty() && !IsOwnHost(visitor.host))
    return EAdmission::WrongHost;
  const auto& allowed = options.allowedOrigins;
  if (!visitor.origin.empty() && !IsOwnOrigin(visitor.origin, visitor.host) &&
      std::find(allowed.begin(), allowed.end(), visitor.origin) == allowed.end())
    return EAdmission::WrongOrigin;
  return EAdmission::Welcome;
}

}
