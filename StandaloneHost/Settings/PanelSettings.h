#pragma once

#include "StoreInterface/IStore.h"

#include <filesystem>
#include <vector>

namespace Settings
{

/// The folders in which files of each sort lie. A file of a later folder takes the place of one with the same name.
struct FileFolders
{
  std::vector<std::filesystem::path> characterTemplates;
  std::vector<std::filesystem::path> smartObjectTemplates;
  std::vector<std::filesystem::path> labellingTemplates;
  std::vector<std::filesystem::path> skins;
  std::vector<std::filesystem::path> retargets;
};

/// Sees to it that every setting of the subject panel exists, with a value of its type: what is missing or of another
/// type gets its default. The files to choose from are those that lie in the folders now; a choice stays as long as its
/// file is there. One edit, whose failure is the answer. [any]
NMX::IResult SetUpPanelSettings(NMX::IStore& store, const FileFolders& folders);

}
