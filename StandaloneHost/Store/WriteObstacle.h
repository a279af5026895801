#pragma once

#include <filesystem>
#include <string>

namespace Store
{

/// What keeps this user from writing a file, as far as the file system can still tell after something has failed:
/// "the file is read-only for this user". Empty when it sees nothing. [any]
[[nodiscard]] std::string WriteObstacle(const std::filesystem::path& file);

/// The error of a call that was to write a file, in words. A disk that has room, but not for one more file, is told
/// apart from a full one. [any]
[[nodiscard]] std::string WriteErrorText(const std::filesystem::path& file, int error);

}
