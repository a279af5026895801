#include "StandaloneHost/VFileLocations.h"

#include "StoreInterface/WideText.h"

#include <utility>

VFileLocations::VFileLocations(std::optional<std::filesystem::path> dataFolder) : m_dataFolder(std::move(dataFolder)) {}

std::vector<std::wstring> VFileLocations::Directories(std::uint32_t location) const
{
  if (location != smartObjectTemplates)
    return {};
  std::vector<std::filesystem::path> folders;
  std::error_code error;
  if (const auto program = std::filesystem::read_symlink("/proc/self/exe", error); !error)
    folders.push_back(program.parent_path().parent_path() / "share/subject-store/SmartObjectTemplates");
  if (m_dataFolder)
    folders.push_back(*m_dataFolder / "SmartObjectTemplates");
  std::vector<std::wstring> wide;
  for (const auto& folder : folders)
    if (auto text = NMX::ToWide(folder.string()))
      wide.push_back(std::move(*text));
  return wide;
}
