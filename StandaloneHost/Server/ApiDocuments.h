#pragma once

#include "StandaloneHost/Server/Registry.h"

#include <memory>
#include <string>

namespace Server
{

/// What describes the API to programs. It follows from what is registered and from nothing else, so that the same
/// program has the same documents wherever and whenever it runs.
struct ApiDocuments
{
  std::shared_ptr<const std::string> functions; ///< OpenRPC
  std::shared_ptr<const std::string> events;    ///< AsyncAPI
  std::string hash;                             ///< SHA-256 of the two, one after the other, in hexadecimal
};

/// Throws std::runtime_error when the hash cannot be computed.
[[nodiscard]] ApiDocuments MakeApiDocuments(const Registry& registry);

}
