#pragma once

#include <filesystem>
#include <functional>
#include <string_view>

namespace Files
{

/// Writes a file that appears whole or stays as it was; the last folder of its path is made if there is none. Before
/// it appears, `check` reads what was written, under another name: whatever is wrong with it, which it throws as
/// ConfigurationError, keeps the file from appearing. Throws ConfigurationError, with `FileIOFailure`, `DiskFull`, or
/// the result of the check; nothing is left behind then. [any]
void WriteWholeFile(const std::filesystem::path& file, std::string_view text,
                    const std::function<void(const std::filesystem::path&)>& check);

}
