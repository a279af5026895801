#pragma once

#include "StandaloneHost/Options.h"

#include <filesystem>
#include <string_view>
#include <sys/types.h>

/// Tells whoever started the host, as long as it is there, that calls are served. It appears whole, and goes with the
/// object unless another file has come in its place. [host]
class ReadyFile
{
public:
  /// No file when the path is empty. Throws std::runtime_error.
  ReadyFile(const std::filesystem::path& file, std::string_view text);
  ReadyFile(const ReadyFile&) = delete;
  ReadyFile& operator=(const ReadyFile&) = delete;
  ~ReadyFile();

private:
  std::filesystem::path m_target;
  int m_descriptor = -1; // keeps the inode from being given to another file
};

/// Refuses a ready file that would replace one that the host keeps or reads, whatever path names it. Throws
/// OptionError.
void CheckReadyFile(const Options& options, const std::filesystem::path& tokenFile);
