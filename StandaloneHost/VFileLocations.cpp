#include "StandaloneHost/VFileLocations.h"

#include "StoreInterface/WideText.h"

#include <utility>

VFileLocations::VFileLocations(std::optional<std::filesystem::path> dataFolder) : m_dataFolder(std::move(dataFolder)) {}

std::vector<std::filesystem::path> VFileLocations::Folders(std::string_view name) const
{
  std::vector<std::filesystem::path> folders;
  std::error_code error;
  if (const auto program = std::filesystem::read_symlink("/proc/self/exe", error); !error)
    folders.push_back(program.parent_path().parent_path() / "share/subject-store" / name);
  if (m_dataFolder)
    folders.push_back(*m_dataFolder / name);
  return folders;
}

std::vector<std::wstring> VFileLocations::Directories(std::uint32_t location) const
{
  std::vector<std::wstring> wide;
  if (location == smartObjectTemplates)
    for (const auto& folder : Folders("SmartObjectTemplates"))
      if (auto text = NMX::ToWide(folder.string()))
        wide.push_back(std::move(*text));
  return wide;
}
