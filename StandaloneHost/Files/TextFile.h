#pragma once

#include <cstddef>
#include <filesystem>
#include <string>

namespace Files
{

/// What a file may have at most, unless its reader says less.
inline constexpr std::size_t maximumFileBytes = std::size_t{64} << 20;

/// The content of a file as UTF-8, without byte order mark. Throws UnreadableFileError when there is no such file or
/// it cannot be read or is no regular file, and ConfigurationError when it is too large, empty, or not UTF-8, or has a
/// tag that is too long. Of a file that is too large, nothing is read.
[[nodiscard]] std::string ReadTextFile(const std::filesystem::path& file, std::size_t maximumBytes = maximumFileBytes);

/// Throws UnreadableFileError unless there is a regular file that can be opened.
void CheckReadable(const std::filesystem::path& file);

}
