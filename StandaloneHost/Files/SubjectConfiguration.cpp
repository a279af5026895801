#include "StandaloneHost/Files/SubjectConfiguration.h"

#include "StandaloneHost/Files/ConfigurationParser.h"
#include "StandaloneHost/Files/ConfigurationText.h"
#include "StandaloneHost/Files/ConfigurationWriter.h"
#include "StandaloneHost/Files/WholeFile.h"
#include "StoreInterface/CalibrationState.h"
#include "StoreInterface/EntryPaths.h"

#include <string>
#include <vector>

namespace Files
{

using NMX::TSubjectStoreId;

namespace
{

void Check(NMX::IResult result)
{
  if (result.Failed())
    throw ConfigurationError("the store cannot be edited: " + std::string(result.Name()), result);
}

/// Adds the content in one edit, which `prepare` begins.
template <class Prepare>
ConfigurationCounts Add(NMX::IStore& store, const ConfigurationContent& content, EKnownDevices known, Prepare prepare)
{
  const auto editor = store.Editor();
  prepare(*editor);
  WriteConfiguration(content, *editor, known);
  if (const NMX::IResult committed = editor->Commit(); committed.Failed())
    throw ConfigurationError("the store cannot keep the subject configuration: " + std::string(committed.Name()),
                             committed);
  return {content.devices.size(), content.presets.size(), content.subjects.size()};
}

/// The content of a file that is read while the host runs: a calibration that ran when the file was written does not
/// run now, and nobody would end it.
ConfigurationContent ReadWithoutCalibrations(const std::filesystem::path& file)
{
  ConfigurationContent content;
  ParseConfiguration(file, content);
  for (SubjectContent& subject : content.subjects)
    for (EntryContent& entry : subject.entries)
      if (entry.path == NMX::Paths::Calibration() && entry.value == NMX::Value(NMX::CalibrationState::running))
        entry.value = NMX::CalibrationState::none;
  return content;
}

void RemoveSubjectsAndPresets(NMX::IEntryEditor& editor)
{
  for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
  {
    std::vector<TSubjectStoreId> ids;
    Check(editor.Subjects(kind, ids));
    for (const TSubjectStoreId id : ids)
      Check(editor.Remove(id));
  }
  for (const NMX::EntryPath& path : editor.ApplicationEntries(NMX::Paths::PathConstant<"Application/ObjectPresets">()))
    Check(editor.SetApplicationEntry(path, {}));
}

void CheckHoldsSubjectsOnly(const std::filesystem::path& file, const ConfigurationContent& content)
{
  if (!content.devices.empty())
    Fail(content.devices.front().place, "there is a device, expected subjects only");
  if (!content.presets.empty())
    Fail(content.presets.front().place, "there is a preset, expected subjects only");
  if (content.subjects.empty())
    Fail({&file}, "there is no subject, expected at least one");
}

/// Sees to it that no subject of the store has a name of the content's.
void FreeNames(NMX::IEntryEditor& editor, const ConfigurationContent& content, bool overwrite)
{
  for (const SubjectContent& subject : content.subjects)
  {
    TSubjectStoreId present;
    if (editor.FindByName(subject.name, present).Failed())
      continue;
    if (!overwrite)
      Fail(subject.place, "there is a subject " + Quoted(subject.name) + " already", NMX::EResult::AlreadyPresent);
    Check(editor.Remove(present));
  }
}

void WriteConfigurationFile(const std::filesystem::path& file, const std::string& text)
{
  WriteWholeFile(file, text,
                 [](const std::filesystem::path& written)
                 {
                   ConfigurationContent content;
                   ParseConfiguration(written, content);
                 });
}

}

ConfigurationCounts LoadSubjectConfigurations(NMX::IStore& store, std::span<const std::filesystem::path> files)
{
  ConfigurationContent content;
  for (const std::filesystem::path& file : files)
    ParseConfiguration(file, content);
  return Add(store, content, EKnownDevices::Refuse, [](NMX::IEntryEditor&) {});
}

ConfigurationCounts ReplaceSubjectConfiguration(NMX::IStore& store, const std::filesystem::path& file)
{
  return Add(store, ReadWithoutCalibrations(file), EKnownDevices::Keep, RemoveSubjectsAndPresets);
}

void ImportSubjects(NMX::IStore& store, const std::filesystem::path& file, bool overwrite)
{
  const ConfigurationContent content = ReadWithoutCalibrations(file);
  CheckHoldsSubjectsOnly(file, content);
  Add(store, content, EKnownDevices::Refuse, [&](NMX::IEntryEditor& editor) { FreeNames(editor, content, overwrite); });
}

void SaveSubjectConfiguration(const NMX::IStore& store, const std::filesystem::path& file)
{
  const std::string text = ConfigurationText(*store.Reader());
  WriteConfigurationFile(file, text);
}

void ExportSubject(const NMX::IStore& store, TSubjectStoreId subject, const std::filesystem::path& file)
{
  const std::string text = ConfigurationText(*store.Reader(), subject);
  WriteConfigurationFile(file, text);
}

}
