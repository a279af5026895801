#pragma once

#include "HostInterface/IFileLocations.h"

#include <filesystem>
#include <optional>
#include <vector>

/// Files that come with the host, beside its program, and then those in the data folder, if there is one. [any]
class VFileLocations final : public IFileLocations
{
public:
  explicit VFileLocations(std::optional<std::filesystem::path> dataFolder);

  [[nodiscard]] std::vector<std::wstring> Directories(std::uint32_t location) const override;
  [[nodiscard]] std::wstring UserDirectory(std::uint32_t location) const override;

  /// What Directories answers, as paths.
  [[nodiscard]] std::vector<std::filesystem::path> Folders(std::uint32_t location) const;

private:
  const std::optional<std::filesystem::path> m_dataFolder;
};
