#include "StandaloneHost/Server/Admission.h"

#include <boost/asio/ip/address.hpp>
#include <boost/beast/core/string.hpp>
#include <openssl/crypto.h>
#include <openssl/evp.h>

#include <algorithm>
#include <optional>
#include <string>

namespace Server
{

namespace
{

/// Calls `step` for each element of a header's list until it answers true, and answers whether it did.
template <class Step>
bool AnyOf(std::string_view list, Step step)
{
  constexpr std::string_view blank = " \t";
  while (!list.empty())
  {
    const std::string_view rest = list.substr(std::min(list.find(','), list.size()));
    std::string_view element = list.substr(0, list.size() - rest.size());
    element.remove_prefix(std::min(element.find_first_not_of(blank), element.size()));
    element.remove_suffix(element.size() - (element.find_last_not_of(blank) + 1));
    if (step(element))
      return true;
    list = rest.substr(rest.empty() ? 0 : 1);
  }
  return false;
}

/// Base64 for URLs, without padding.
std::string Base64Url(std::string_view bytes)
{
  std::string text(4 * ((bytes.size() + 2) / 3) + 1, '\0');
  const int size =
      EVP_EncodeBlock(reinterpret_cast<unsigned char*>(text.data()),
                      reinterpret_cast<const unsigned char*>(bytes.data()), static_cast<int>(bytes.size()));
  text.resize(static_cast<std::size_t>(size));
  std::replace(text.begin(), text.end(), '+', '-');
  std::replace(text.begin(), text.end(), '/', '_');
  text.resize(text.find_last_not_of('=') + 1);
  return text;
}

/// Compares in a time that tells no more than whether the length is right.
bool SameSecret(std::string_view given, std::string_view secret)
{
  return given.size() == secret.size() && CRYPTO_memcmp(given.data(), secret.data(), secret.size()) == 0;
}

/// What follows the scheme "Bearer", whose case does not matter; nothing when there is another scheme.
std::optional<std::string_view> BearerToken(std::string_view authorisation)
{
  constexpr std::string_view scheme = "bearer ";
  const std::string_view begin = authorisation.substr(0, scheme.size());
  if (!boost::beast::iequals({begin.data(), begin.size()}, {scheme.data(), scheme.size()}))
    return std::nullopt;
  authorisation.remove_prefix(std::min(authorisation.find_first_not_of(' ', scheme.size()), authorisation.size()));
  return authorisation;
}

bool PresentsToken(const Visitor& visitor, const std::string& token)
{
  if (const auto given = BearerToken(visitor.authorisation))
    return SameSecret(*given, token);
  constexpr std::string_view prefix = "bearer.";
  const std::string encoded = visitor.protocols.empty() ? std::string{} : Base64Url(token);
  return AnyOf(visitor.protocols, [&](std::string_view protocol)
               { return protocol.starts_with(prefix) && SameSecret(protocol.substr(prefix.size()), encoded); });
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

bool IsOwnOrigin(std::string_view origin, std::string_view host, bool encrypted)
{
  return origin == (encrypted ? "https://" : "http://") + std::string(host);
}

}

namespace http = boost::beast::http;

Refusal RefusalFor(EAdmission admission)
{
  switch (admission)
  {
  case EAdmission::NoToken:
    return {ERefusal::NoToken, http::status::unauthorized,
            "The token is missing or wrong: send \"Authorization: Bearer TOKEN\".\n"};
  case EAdmission::WrongOrigin:
    return {ERefusal::WrongOrigin, http::status::forbidden,
            "Web pages of this origin may not connect; the host allows them with --allow-origin.\n"};
  case EAdmission::WrongHost:
  case EAdmission::Welcome:
    break;
  }
  return {ERefusal::WrongHost, http::status::forbidden,
          "This host is reached by its address or as localhost, not by that name.\n"};
}

EAdmission Admit(const Visitor& visitor, const ServerOptions& options)
{
  if (!options.token.empty() && !visitor.open && !PresentsToken(visitor, options.token))
    return EAdmission::NoToken;
  if (options.token.empty() && !visitor.host.empty() && !IsOwnHost(visitor.host))
    return EAdmission::WrongHost;
  const auto& allowed = options.allowedOrigins;
  if (!visitor.origin.empty() && !IsOwnOrigin(visitor.origin, visitor.host, options.Encrypted()) &&
      std::find(allowed.begin(), allowed.end(), visitor.origin) == allowed.end())
    return EAdmission::WrongOrigin;
  return EAdmission::Welcome;
}

bool OffersProtocol(std::string_view protocols)
{
  return AnyOf(protocols, [](std::string_view protocol) { return protocol == webSocketProtocol; });
}

}
