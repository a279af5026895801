#include "StandaloneHost/VFileLocations.h"

#include "StoreInterface/WideText.h"

#include <array>
#include <string_view>
#include <utility>

namespace
{

/// The name of the folder of each location, in the order of the bits.
constexpr std::array<std::string_view, 15> folderNames = {"LabellingTemplates",
                                                          "CharacterTemplates",
                                                          "Retargets",
                                                          "MarkerlessTemplates",
                                                          "RetargetSkins",
                                                          "SubjectSkins",
                                                          "PropSkins",
                                                          "CharacterSkins",
                                                          "SubjectConfigurations",
                                                          "Subjects",
                                                          "SmartObjectTemplates",
                                                          "Props",
                                                          "LabellingClusters",
                                                          "Objects",
                                                          "Exports"};

/// Empty for an unknown location.
std::string_view FolderName(std::uint32_t location)
{
  for (std::size_t bit = 0; bit < folderNames.size(); ++bit)
    if (location == 1U << bit)
      return folderNames[bit];
  return {};
}

}

VFileLocations::VFileLocations(std::optional<std::filesystem::path> dataFolder) : m_dataFolder(std::move(dataFolder)) {}

std::vector<std::filesystem::path> VFileLocations::Folders(std::uint32_t location) const
{
  std::vector<std::filesystem::path> folders;
  const std::string_view name = FolderName(location);
  if (name.empty())
    return folders;
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
  for (const auto& folder : Folders(location))
    if (auto text = NMX::ToWide(folder.string()))
      wide.push_back(std::move(*text));
  return wide;
}

std::wstring VFileLocations::UserDirectory(std::uint32_t location) const
{
  const std::string_view name = FolderName(location);
  if (!m_dataFolder || name.empty())
    return {};
  return NMX::ToWide((*m_dataFolder / name).string()).value_or(std::wstring{});
}
