#pragma once

#include "HostInterface/IFileLocations.h"

#include <filesystem>
#include <optional>
#include <string_view>
#include <vector>

/// Files that come with the host, beside its program, and then those in the data folder, if there is one. [any]
class VFileLocations final : public IFileLocations
{
public:
  explicit VFileLocations(std::optional<std::filesystem::path> dataFolder);

  [[nodiscard]] std::vector<std::wstring> Directories(std::uint32_t location) const override;

  /// The folders of that name, such as "SmartObjectTemplates", in the order in which they are searched.
  [[nodiscard]] std::vector<std::filesystem::path> Folders(std::string_view name) const;

private:
  const std::optional<std::filesystem::path> m_dataFolder;
};
