#include "StandaloneHost/Files/ConfigurationWriter.h"

#include "StandaloneHost/Store/NameRule.h"
#include "StoreInterface/EntryPaths.h"

#include <string_view>
#include <unordered_map>
#include <utility>

namespace Files
{

using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;
using Store::NameRule::Canonical;
namespace Paths = NMX::Paths;

namespace
{

/// Where each key was first given.
template <class Key>
using Places = std::unordered_map<Key, Place>;

template <class Key>
void CheckUnique(Places<Key>& places, Key key, const Place& place, const std::string& what)
{
  const auto [known, added] = places.emplace(key, place);
  if (!added)
    Fail(place, "duplicate " + what + ", expected another than at " + PlaceText(known->second));
}

class Writer
{
public:
  explicit Writer(NMX::IEntryEditor& editor) : m_editor(editor) {}

  void AddDevices(const std::vector<DeviceContent>& devices, EKnownDevices known);
  void AddPresets(const std::vector<PresetContent>& presets);
  void AddSubjects(const std::vector<SubjectContent>& subjects);
  void LinkSubjects(const std::vector<SubjectContent>& subjects);

private:
  struct Added
  {
    TSubjectStoreId id;
    const SubjectContent* subject;
  };

  void AddSubject(const SubjectContent& subject);
  /// The subject of that name; `role` is what it is sought as.
  const Added& Find(const Place& place, std::string_view role, const std::string& name) const;
  void SetParent(const Place& place, TSubjectStoreId child, TSubjectStoreId parent, const std::string& what);
  void FillSlot(const Added& character, const FillingContent& filling);
  void SetValue(const Place& place, TSubjectStoreId id, NMX::EntryPath path, NMX::Value value);
  void SetApplicationEntry(const Place& place, const std::string& path, NMX::Value value);

  NMX::IEntryEditor& m_editor;
  std::unordered_map<std::string, Added> m_added; // by the names' canonical forms
  Places<TSubjectStoreId> m_fillings;             // by the object
};

void Writer::AddDevices(const std::vector<DeviceContent>& devices, EKnownDevices known)
{
  Places<std::string_view> urns;
  for (const DeviceContent& device : devices)
  {
    CheckUnique<std::string_view>(urns, device.urn, device.place, "device " + Quoted(device.urn));
    const std::string path = "Application/Devices/" + device.urn;
    if (known == EKnownDevices::Keep && m_editor.FindApplicationEntry(NMX::EntryPath(path + "/Type")) != nullptr)
      continue;
    SetApplicationEntry(device.place, path + "/Type", device.type);
    SetApplicationEntry(device.place, path + "/Connected", device.connected);
    SetApplicationEntry(device.place, path + "/Charging", device.charging);
    SetApplicationEntry(device.place, path + "/Battery", device.battery);
    SetApplicationEntry(device.place, path + "/Radio", device.radio);
  }
}

void Writer::AddPresets(const std::vector<PresetContent>& presets)
{
  Places<std::uint32_t> ids;
  Places<std::string_view> names;
  for (const PresetContent& preset : presets)
  {
    CheckUnique(ids, preset.id, preset.place, "preset " + std::to_string(preset.id));
    CheckUnique<std::string_view>(names, preset.name, preset.place, "preset name " + Quoted(preset.name));
    const std::string path = "Application/ObjectPresets/" + std::to_string(preset.id) + '/';
    SetApplicationEntry(preset.place, path + "Name", preset.name);
    SetApplicationEntry(preset.place, path + "ReadOnly", preset.readOnly);
    for (const EntryContent& parameter : preset.parameters)
      SetApplicationEntry(parameter.place, path + std::string(parameter.path.Text()), parameter.value);
  }
}

void Writer::AddSubjects(const std::vector<SubjectContent>& subjects)
{
  Places<std::string> names;
  for (const SubjectContent& subject : subjects)
  {
    CheckUnique(names, Canonical(subject.name), subject.place, "subject name " + Quoted(subject.name));
    AddSubject(subject);
  }
}

void Writer::AddSubject(const SubjectContent& subject)
{
  TSubjectStoreId id;
  const IResult added = m_editor.Add(subject.kind, subject.name, id);
  if (added == EResult::InvalidName)
    Fail(subject.place,
         "the store refuses the name " + Quoted(subject.name) + " (InvalidName), expected one that matches " +
             m_editor.NamePattern(),
         added);
  if (added.Failed())
    Fail(subject.place, "the store refuses the subject " + Quoted(subject.name) + ": " + std::string(added.Name()),
         added);
  m_added.emplace(Canonical(subject.name), Added{id, &subject});
  for (const EntryContent& entry : subject.entries)
    SetValue(entry.place, id, entry.path, entry.value);
}

void Writer::LinkSubjects(const std::vector<SubjectContent>& subjects)
{
  for (const SubjectContent& subject : subjects)
  {
    const Added& added = m_added.at(Canonical(subject.name));
    if (subject.parent)
      SetParent(subject.place, added.id, Find(subject.place, "parent", *subject.parent).id,
                "parent " + Quoted(*subject.parent));
    for (const FillingContent& filling : subject.fillings)
      FillSlot(added, filling);
  }
}

const Writer::Added& Writer::Find(const Place& place, std::string_view role, const std::string& name) const
{
  const auto found = m_added.find(Canonical(name));
  if (found == m_added.end())
    Fail(place, "unknown " + std::string(role) + ' ' + Quoted(name) + ", expected the name of a loaded subject");
  return found->second;
}

void Writer::SetParent(const Place& place, TSubjectStoreId child, TSubjectStoreId parent, const std::string& what)
{
  const IResult set = m_editor.SetValue(child, Paths::ParentSubjectId(), parent);
  if (set == EResult::InvalidValue)
    Fail(place, what + " would make a subject its own ancestor, expected subjects without a cycle");
  if (set.Failed())
    Fail(place, "the store refuses the " + what + ": " + std::string(set.Name()), set);
}

void Writer::FillSlot(const Added& character, const FillingContent& filling)
{
  const Added& object = Find(filling.place, "object", filling.object);
  const std::string what = "object " + Quoted(filling.object);
  if ((NMX::KindFlags(object.subject->kind) & NMX::SubjectFlag::objectKindMask) == 0)
    Fail(filling.place, Quoted(filling.object) + " is of kind " + std::string(NMX::KindKey(object.subject->kind)) +
                            ", expected a basic or smart object");
  if (object.subject->parent)
    Fail(filling.place, what + " has a parent of its own, expected none (at " + PlaceText(object.subject->place) + ")");
  const auto [known, added] = m_fillings.emplace(object.id, filling.place);
  if (!added)
    Fail(filling.place,
         what + " is already in the slot at " + PlaceText(known->second) + ", expected it in one slot only");
  SetParent(filling.place, object.id, character.id, what);
  SetValue(filling.place, object.id, Paths::ParentSubjectSlotId(), filling.slot);
}

void Writer::SetValue(const Place& place, TSubjectStoreId id, NMX::EntryPath path, NMX::Value value)
{
  if (const IResult set = m_editor.SetValue(id, path, std::move(value)); set.Failed())
    Fail(place, "the store refuses the value of " + std::string(path.Text()) + ": " + std::string(set.Name()), set);
}

void Writer::SetApplicationEntry(const Place& place, const std::string& path, NMX::Value value)
{
  // The loading adds; it never replaces what was set before.
  if (m_editor.FindApplicationEntry(NMX::EntryPath(path)) != nullptr)
    Fail(place, "the store already holds " + Quoted(path) + ", expected it to be new", EResult::AlreadyPresent);
  if (const IResult set = m_editor.SetApplicationEntry(NMX::EntryPath(path), std::move(value)); set.Failed())
    Fail(place, "the store refuses " + Quoted(path) + ": " + std::string(set.Name()), set);
}

}

void WriteConfiguration(const ConfigurationContent& content, NMX::IEntryEditor& editor, EKnownDevices known)
{
  Writer writer(editor);
  writer.AddDevices(content.devices, known);
  writer.AddPresets(content.presets);
  writer.AddSubjects(content.subjects);
  writer.LinkSubjects(content.subjects);
}

}
