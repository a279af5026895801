#include "StandaloneHost/Server/TlsContext.h"

#include "StandaloneHost/Server/VServer.h"

#include <openssl/ssl.h>

#include <string_view>

namespace Server
{

namespace ssl = boost::asio::ssl;

namespace
{

/// Takes HTTP/1.1 of the protocols that the client offers; goes on without a word when it offers others only.
int ChooseProtocol(SSL* /*connection*/, const unsigned char** chosen, unsigned char* chosenSize,
                   const unsigned char* offered, unsigned offeredSize, void* /*unused*/)
{
  static constexpr std::string_view http = "http/1.1";
  for (unsigned place = 0; place < offeredSize; place += 1U + offered[place])
  {
    const unsigned char* name = offered + place + 1;
    if (std::string_view(reinterpret_cast<const char*>(name), offered[place]) != http)
      continue;
    *chosen = name;
    *chosenSize = offered[place];
    return SSL_TLSEXT_ERR_OK;
  }
  return SSL_TLSEXT_ERR_NOACK;
}

template <class Step>
void Do(Step step, std::string_view what, const std::filesystem::path& file)
{
  boost::system::error_code error;
  step(error);
  if (error)
    throw ServerError("cannot use the " + std::string(what) + " \"" + file.string() + "\": " + error.message());
}

}

std::unique_ptr<ssl::context> MakeTlsContext(const std::filesystem::path& certificate, const std::filesystem::path& key)
{
  auto context = std::make_unique<ssl::context>(ssl::context::tls_server);
  context->set_options(ssl::context::default_workarounds | ssl::context::no_tlsv1 | ssl::context::no_tlsv1_1 |
                       ssl::context::no_compression | SSL_OP_NO_RENEGOTIATION | SSL_OP_CIPHER_SERVER_PREFERENCE);
  // What is recorded today must not be read by whoever gets the key later; there is no list of ciphers for TLS 1.3.
  if (SSL_CTX_set_cipher_list(context->native_handle(), "ECDHE+AESGCM:ECDHE+CHACHA20") != 1)
    throw ServerError("TLS offers no cipher that keeps its word when the key is lost");
  SSL_CTX_set_session_cache_mode(context->native_handle(), SSL_SESS_CACHE_OFF); // strangers would fill it
  // A key with a password would be asked for on the terminal.
  context->set_password_callback([](std::size_t, ssl::context::password_purpose) { return std::string{}; });
  SSL_CTX_set_alpn_select_cb(context->native_handle(), ChooseProtocol, nullptr);
  SSL_CTX_set_mode(context->native_handle(), SSL_MODE_RELEASE_BUFFERS); // idle clients keep none
  Do([&](auto& error) { context->use_certificate_chain_file(certificate.string(), error); }, "certificate",
     certificate);
  Do([&](auto& error) { context->use_private_key_file(key.string(), ssl::context::pem, error); }, "private key", key);
  if (SSL_CTX_check_private_key(context->native_handle()) != 1)
    throw ServerError("the private key \"" + key.string() + "\" is not that of the certificate \"" +
                      certificate.string() + '"');
  return context;
}

}
