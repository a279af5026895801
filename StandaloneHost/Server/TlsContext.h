#pragma once

#include <boost/asio/ssl/context.hpp>

#include <filesystem>
#include <memory>

namespace Server
{

/// What a server needs to speak TLS (1.2 or later): `certificate` is a PEM file with its certificate, followed by those
/// between it and the authority; `key` a PEM file with the private key, not protected by a password. Throws ServerError
/// that names the file.
[[nodiscard]] std::unique_ptr<boost::asio::ssl::context> MakeTlsContext(const std::filesystem::path& certificate,
                                                                        const std::filesystem::path& key);

}
