#pragma once

#include <cstddef>
#include <filesystem>
#include <string>

namespace Files
{

/// What a file may have at most, unless its reader says less.
inline constexpr std::size_t maximumFileBytes = std::size_t{64} << 20;

/// The content of a file as UTF-8, without byte order mark. Throws ConfigurationError when there is no such file or
/// it cannot be read, is no regular file, is too large, empty, or not UTF-8. Of a file that is too large, nothing is
/// read.
[[nodiscard]] std::string ReadTextFile(const std::filesystem::path& file, std::size_t maximumBytes = maximumFileBytes);

}
