#include "StandaloneHost/Server/ApiDocuments.h"

#include "StandaloneHost/Server/Description.h"
#include "StandaloneHost/Server/EventDescription.h"

#include <openssl/evp.h>

#include <array>
#include <stdexcept>
#include <string_view>
#include <utility>

namespace Server
{

namespace
{

std::string Sha256(std::string_view text)
{
  std::array<unsigned char, EVP_MAX_MD_SIZE> digest;
  unsigned size = 0;
  if (EVP_Digest(text.data(), text.size(), digest.data(), &size, EVP_sha256(), nullptr) != 1)
    throw std::runtime_error("the description of the API cannot be hashed");
  static constexpr std::string_view digits = "0123456789abcdef";
  std::string hexadecimal;
  for (unsigned i = 0; i < size; ++i)
  {
    hexadecimal += digits[digest[i] >> 4];
    hexadecimal += digits[digest[i] & 0xF];
  }
  return hexadecimal;
}

}

ApiDocuments MakeApiDocuments(const Registry& registry)
{
  const auto share = [](std::string text) { return std::make_shared<const std::string>(std::move(text)); };
  ApiDocuments documents{share(DescribeApi(registry)), share(DescribeEvents(registry)), {}};
  documents.hash = Sha256(*documents.functions + *documents.events);
  return documents;
}

}
