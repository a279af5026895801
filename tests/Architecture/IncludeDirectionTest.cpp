#include <gmock/gmock.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <regex>
#include <set>
#include <string>
#include <vector>

namespace
{

namespace fs = std::filesystem;

/// For each folder, the folders whose headers it may include beside its own. A folder that is missing here fails.
const std::map<std::string, std::set<std::string>> allowed{
    {"HostInterface", {}},
    {"StoreInterface", {"HostInterface"}},

    {"StoreUI", {"HostInterface", "StoreInterface"}},
    {"SubjectStoreUI",
     {"StoreUI", "RunaCorePluginSubjectStore/Subjects", "RunaCorePluginSubjectStore/SmartObjectServices",
      "RunaCorePluginSubjectStore/SubjectCalibrationServices", "HostInterface", "StoreInterface"}},

    {"RunaCorePluginSubjectStore/Subjects", {"HostInterface", "StoreInterface"}},
    {"RunaCorePluginSubjectStore/BasicObjectServices",
     {"RunaCorePluginSubjectStore/Subjects", "HostInterface", "StoreInterface"}},
    {"RunaCorePluginSubjectStore/SmartObjectServices",
     {"RunaCorePluginSubjectStore/Subjects", "HostInterface", "StoreInterface"}},
    {"RunaCorePluginSubjectStore/CharacterFromClustersServices",
     {"RunaCorePluginSubjectStore/Subjects", "HostInterface", "StoreInterface"}},
    {"RunaCorePluginSubjectStore/ObjectEvaluationServices",
     {"RunaCorePluginSubjectStore/Subjects", "HostInterface", "StoreInterface"}},
    {"RunaCorePluginSubjectStore/SubjectCalibrationServices",
     {"RunaCorePluginSubjectStore/Subjects", "HostInterface", "StoreInterface"}},
    {"RunaCorePluginSubjectStore/TerminalServer2", {"HostInterface"}},
    {"RunaCorePluginSubjectStore/Catalogue",
     {"RunaCorePluginSubjectStore/TerminalServer2", "RunaCorePluginSubjectStore/BasicObjectServices",
      "RunaCorePluginSubjectStore/SmartObjectServices", "RunaCorePluginSubjectStore/CharacterFromClustersServices",
      "RunaCorePluginSubjectStore/ObjectEvaluationServices", "RunaCorePluginSubjectStore/SubjectCalibrationServices",
      "HostInterface"}},
    {"RunaCorePluginSubjectStore/Plugin",
     {"RunaCorePluginSubjectStore/Catalogue", "RunaCorePluginSubjectStore/TerminalServer2",
      "RunaCorePluginSubjectStore/BasicObjectServices", "RunaCorePluginSubjectStore/CharacterFromClustersServices",
      "RunaCorePluginSubjectStore/ObjectEvaluationServices", "RunaCorePluginSubjectStore/SmartObjectServices",
      "RunaCorePluginSubjectStore/SubjectCalibrationServices", "SubjectStoreUI", "StoreUI", "HostInterface",
      "StoreInterface"}},

    {"StandaloneHost/Store", {"HostInterface", "StoreInterface"}},
    {"StandaloneHost/Evaluation", {"HostInterface", "StoreInterface"}},
    {"StandaloneHost/Logging", {"HostInterface"}},
    {"StandaloneHost/Postal", {"HostInterface"}},
    {"StandaloneHost/Page", {}},
    {"StandaloneHost/Server", {"StandaloneHost/Page", "HostInterface"}},
    {"StandaloneHost/Simulation", {"HostInterface", "StoreInterface"}},
    {"StandaloneHost/CommandLine", {"StandaloneHost/Server", "HostInterface"}},
    {"StandaloneHost/Window", {"StandaloneHost/Logging", "StandaloneHost/Server", "HostInterface"}},
    {"StandaloneHost/Files", {"StandaloneHost/Store", "HostInterface", "StoreInterface"}},
    {"StandaloneHost/Settings", {"StandaloneHost/Store", "HostInterface", "StoreInterface"}},
    {"StandaloneHost/Calibration", {"StandaloneHost/Files", "StandaloneHost/Store", "HostInterface", "StoreInterface"}},
    {"StandaloneHost/Characters", {"StandaloneHost/Files", "HostInterface", "StoreInterface"}},
    {"StandaloneHost/SmartObjects",
     {"StandaloneHost/Files", "StandaloneHost/Store", "HostInterface", "StoreInterface"}},
    {"StandaloneHost/FileIO",
     {"StandaloneHost/Calibration", "StandaloneHost/Characters", "StandaloneHost/Files", "StandaloneHost/SmartObjects",
      "HostInterface", "StoreInterface"}},
    {"StandaloneHost/Panel", {"HostInterface", "StoreInterface"}},
    {"StandaloneHost",
     {"StandaloneHost/FileIO", "StandaloneHost/Panel", "StandaloneHost/Store", "StandaloneHost/Postal",
      "StandaloneHost/Server", "StandaloneHost/Files", "StandaloneHost/Calibration", "StandaloneHost/Settings",
      "StandaloneHost/Characters", "StandaloneHost/CommandLine", "StandaloneHost/Evaluation",
      "StandaloneHost/Simulation", "StandaloneHost/SmartObjects", "StandaloneHost/Logging", "StandaloneHost/Window",
      "HostInterface", "StoreInterface"}},
};

/// The folder of `allowed` that a file belongs to: the deepest that its path begins with.
std::string FolderOf(const std::string& path)
{
  for (std::string folder = fs::path(path).parent_path().string(); !folder.empty();
       folder = fs::path(folder).parent_path().string())
    if (allowed.contains(folder))
      return folder;
  return {};
}

}

TEST(Architecture, FoldersIncludeOnlyDownwards)
{
  const fs::path root = SUBJECT_STORE_SOURCE_DIR;
  const std::regex include("^\\s*#\\s*include\\s+\"([^\"]+)\"");
  std::vector<std::string> wrong;
  int files = 0;
  for (const char* top :
       {"HostInterface", "StoreInterface", "StoreUI", "SubjectStoreUI", "RunaCorePluginSubjectStore", "StandaloneHost"})
    for (const auto& entry : fs::recursive_directory_iterator(root / top))
    {
      if (entry.path().extension() != ".h" && entry.path().extension() != ".cpp")
        continue;
      ++files;
      const std::string file = fs::relative(entry.path(), root).string();
      const std::string folder = FolderOf(file);
      if (folder.empty())
      {
        wrong.push_back(file + " is in a folder without a rule");
        continue;
      }
      std::ifstream in(entry.path());
      for (std::string line; std::getline(in, line);)
      {
        std::smatch match;
        if (!std::regex_search(line, match, include))
          continue;
        const std::string target = FolderOf(match[1]);
        if (target != folder && !allowed.at(folder).contains(target))
          wrong.push_back(file + " includes " + match[1].str());
      }
    }
  EXPECT_GT(files, 50);
  EXPECT_THAT(wrong, testing::IsEmpty());
}
