#pragma once

#include "HostInterface/IFileLocations.h"

#include <filesystem>
#include <optional>

/// Where this host keeps files: beside the program what came with it, in the data folder what the user has added. [any]
class VFileLocations final : public IFileLocations
{
public:
  explicit VFileLocations(std::optional<std::filesystem::path> dataFolder);

  [[nodiscard]] std::vector<std::wstring> Directories(std::uint32_t location) const override;

private:
  const std::optional<std::filesystem::path> m_dataFolder;
};
