#pragma once

#include <filesystem>
#include <string>

namespace Server
{

/// The token in the first line of a file: up to 512 printable ASCII characters, which fit into a header, so that every
/// client can present it. Throws ServerError that names the file. [any]
[[nodiscard]] std::string ReadTokenFile(const std::filesystem::path& file);

}
