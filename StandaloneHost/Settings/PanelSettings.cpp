#include "StandaloneHost/Settings/PanelSettings.h"

#include "StandaloneHost/Store/NameRule.h"
#include "StoreInterface/SettingsPaths.h"
#include "StoreInterface/WideText.h"

#include <algorithm>
#include <map>
#include <string>
#include <system_error>
#include <utility>

namespace Settings
{

using NMX::ESetting;
using NMX::IResult;

namespace
{

struct Default
{
  ESetting setting;
  NMX::Value value;
};

NMX::Action Impossible(const char* reason)
{
  return {NMX::Action::impossible, reason};
}

/// Of the actions, those that are derived from other settings only need to be there.
std::vector<Default> Defaults()
{
  const std::string noName;
  return {{ESetting::AddMarkerToObjectAction, Impossible("No object and marker are selected.")},
          {ESetting::CalibrateOnCreate, true},
          {ESetting::CalibrationAction, NMX::Action{}},
          {ESetting::CancelCalibrationAction, NMX::Action{}},
          {ESetting::CancelledCalibrationGracePeriod, 5.0}, // s
          {ESetting::CaptureCancelledCalibrations, false},
          {ESetting::CaptureProcessed, true},
          {ESetting::CaptureVideo, false},
          {ESetting::CreateCFCAction, NMX::Action{}},
          {ESetting::CreateCFCName, noName},
          {ESetting::CreateLabellingClusterAction, NMX::Action{}},
          {ESetting::CreateLabellingClusterName, noName},
          {ESetting::CreateObjectAction, NMX::Action{}},
          {ESetting::CreateObjectName, noName},
          {ESetting::CreateSmartObjectAction, NMX::Action{}},
          {ESetting::CreateSmartObjectName, noName},
          {ESetting::CreateSubjectAction, NMX::Action{}},
          {ESetting::CreateSubjectName, noName},
          {ESetting::EnableCapture, false},
          {ESetting::LabellingClusterSelection, std::vector<NMX::TSubjectStoreId>{}},
          {ESetting::LinkCameraAction, Impossible("No labelling cluster and camera are selected.")},
          {ESetting::NameRegex, std::string(Store::NameRule::pattern)},
          {ESetting::RemoveMarkerFromObjectAction, Impossible("No marker of an object is selected.")},
          {ESetting::UnlinkCameraAction, Impossible("No labelling cluster with a camera is selected.")}};
}

enum class EFirstChoice : bool
{
  None,
  FirstFile
};

/// A setting that is one of the files in some folders.
struct FileSetting
{
  ESetting setting;
  std::vector<std::filesystem::path> FileFolders::* folders;
  const char* extension; ///< empty: any
  EFirstChoice first;    ///< what is chosen until somebody chooses
};

constexpr FileSetting fileSettings[] = {
    {ESetting::CreateCFCRetarget, &FileFolders::retargets, "", EFirstChoice::None},
    {ESetting::CreateCFCTemplate, &FileFolders::characterTemplates, ".cct", EFirstChoice::FirstFile},
    {ESetting::CreateSmartObjectTemplate, &FileFolders::smartObjectTemplates, ".sot", EFirstChoice::FirstFile},
    {ESetting::CreateSubjectSkin, &FileFolders::skins, ".skin", EFirstChoice::FirstFile},
    {ESetting::CreateSubjectTemplate, &FileFolders::labellingTemplates, ".lbt", EFirstChoice::FirstFile},
};

/// More than anybody would choose from.
constexpr std::size_t maximumFiles = 1000;

/// The files, by their names without extension, in the order of the names. What cannot be read, or has a name that is
/// not UTF-8, is left out, and so is what comes after the first thousand.
std::vector<NMX::Choice> FindFiles(const std::vector<std::filesystem::path>& folders, const std::string& extension)
{
  std::map<std::string, std::wstring> files;
  for (const auto& folder : folders)
  {
    std::error_code error;
    for (std::filesystem::directory_iterator next(folder, error), end;
         !error && next != end && files.size() < maximumFiles; next.increment(error))
    {
      std::error_code unknown;
      const std::filesystem::path file = std::filesystem::absolute(next->path(), unknown).lexically_normal();
      auto path = NMX::ToWide(file.string());
      if (!unknown && path && next->is_regular_file(unknown) && (extension.empty() || file.extension() == extension))
        files.insert_or_assign(file.stem().string(), std::move(*path));
    }
  }
  std::vector<NMX::Choice> choices;
  choices.reserve(files.size());
  for (auto& [name, path] : files)
    choices.push_back({name, std::move(path)});
  return choices;
}

/// The setting as it is, with the files as they are now.
NMX::Option Updated(const NMX::IStoreReader& access, const FileSetting& file, const FileFolders& folders)
{
  const NMX::Value* value = access.FindApplicationEntry(NMX::PathOf(file.setting));
  const auto* current = value != nullptr ? std::get_if<NMX::Option>(value) : nullptr;
  NMX::Option option{current != nullptr ? current->chosen : std::wstring{},
                     FindFiles(folders.*file.folders, file.extension)};
  const bool there = std::any_of(option.choices.begin(), option.choices.end(),
                                 [&](const NMX::Choice& choice) { return choice.path == option.chosen; });
  if (!there)
    option.chosen =
        file.first == EFirstChoice::FirstFile && !option.choices.empty() ? option.choices.front().path : std::wstring{};
  return option;
}

}

IResult SetUpPanelSettings(NMX::IStore& store, const FileFolders& folders)
{
  const auto editor = store.Editor();
  for (Default& setting : Defaults())
  {
    const NMX::EntryPath path = NMX::PathOf(setting.setting);
    const NMX::Value* current = editor->FindApplicationEntry(path);
    if (current != nullptr && NMX::TypeOf(*current) == NMX::TypeOf(setting.value))
      continue;
    if (const IResult set = editor->SetApplicationEntry(path, std::move(setting.value)); set.Failed())
      return set;
  }
  for (const FileSetting& file : fileSettings)
    if (const IResult set = editor->SetApplicationEntry(NMX::PathOf(file.setting), Updated(*editor, file, folders));
        set.Failed())
      return set;
  return editor->Commit();
}

}
