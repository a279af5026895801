#include "StandaloneHost/Files/ConfigurationText.h"

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StandaloneHost/Files/ElementParts.h"
#include "StandaloneHost/Files/ElementWriter.h"
#include "StandaloneHost/Files/EntryTree.h"
#include "StandaloneHost/Files/ValueText.h"
#include "StandaloneHost/Store/NameRule.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/ValueLimits.h"

#include <algorithm>
#include <map>
#include <set>
#include <utility>
#include <vector>

namespace Files
{

using NMX::EValueType;
using NMX::IStoreReader;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

constexpr std::string_view devices = "Application/Devices";
constexpr std::string_view presets = "Application/ObjectPresets";

void Check(NMX::IResult result)
{
  if (result.Failed())
    throw ConfigurationError("the store cannot be read: " + std::string(result.Name()), result);
}

/// What lies beneath a path and has an entry of that name, with a text: each as the part of the path before the name.
std::vector<std::string> KeysWith(const IStoreReader& store, std::string_view parent, std::string_view name)
{
  std::vector<std::string> keys;
  const std::string end = '/' + std::string(name);
  for (const NMX::EntryPath& path : store.ApplicationEntries(NMX::EntryPath(parent)))
  {
    const std::string_view key = path.Text().substr(parent.size() + 1);
    if (key.ends_with(end) && key.find('/') == key.size() - end.size() &&
        std::holds_alternative<std::string>(*store.FindApplicationEntry(path)))
      keys.emplace_back(key.substr(0, key.size() - end.size()));
  }
  return keys;
}

/// Each number has one text: without a sign or leading zeros.
bool IsPresetNumber(std::string_view text)
{
  return !text.starts_with('0') && std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
}

/// Null when there is no such entry.
const NMX::Value* FindEntry(const IStoreReader& store, const std::string& path)
{
  const auto known = NMX::EntryPath::Known(path);
  return known ? store.FindApplicationEntry(*known) : nullptr;
}

/// An application entry, or the default where there is none of that type.
template <class T>
std::string EntryText(const IStoreReader& store, const std::string& path)
{
  const NMX::Value* value = FindEntry(store, path);
  return TextOf(value != nullptr && std::holds_alternative<T>(*value) ? *value : NMX::Value(T{}));
}

void AddDevices(ElementWriter& xml, const IStoreReader& store)
{
  xml.Open("Devices");
  for (const std::string& urn : KeysWith(store, devices, "Type"))
  {
    const std::string path = std::string(devices) + '/' + urn + '/';
    // One that is just rebooting comes back, but nobody would bring it back from a file.
    const bool rebooting = FindEntry(store, path + "Rebooting") != nullptr;
    xml.Add("Device", {{"urn", urn},
                       {"type", EntryText<std::string>(store, path + "Type")},
                       {"connected", rebooting ? "true" : EntryText<bool>(store, path + "Connected")},
                       {"charging", EntryText<bool>(store, path + "Charging")},
                       {"battery", EntryText<std::uint32_t>(store, path + "Battery")},
                       {"radio", EntryText<std::uint32_t>(store, path + "Radio")}});
  }
  xml.CloseUnlessEmpty();
}

void AddPresets(ElementWriter& xml, const IStoreReader& store)
{
  xml.Open("Presets");
  for (const std::string& id : KeysWith(store, presets, "Name"))
  {
    if (!IsPresetNumber(id))
      continue;
    const std::string path = std::string(presets) + '/' + id + '/';
    xml.Open("Preset", {{"id", id},
                        {"name", EntryText<std::string>(store, path + "Name")},
                        {"readOnly", EntryText<bool>(store, path + "ReadOnly")}});
    for (const EntryNode& parameter : PresetParameters().children)
      if (const NMX::Value* value = FindEntry(store, path + std::string(parameter.entry->path.Text()));
          value != nullptr && NMX::TypeOf(*value) == parameter.entry->type)
        xml.AddText(parameter.name, TextOf(*value));
    xml.Close();
  }
  xml.CloseUnlessEmpty();
}

/// Writes subjects, as far as they belong to those that are written.
class SubjectWriter
{
public:
  SubjectWriter(ElementWriter& xml, const IStoreReader& store, const std::vector<TSubjectStoreId>& subjects)
      : m_xml(xml), m_store(store), m_subjects(subjects.begin(), subjects.end())
  {
  }

  void Write(TSubjectStoreId id);

private:
  void WriteEntries(TSubjectStoreId id, const EntryNode& node);
  void WriteEntry(TSubjectStoreId id, const EntryNode& node, const NMX::Value& value);
  void WriteSlots(TSubjectStoreId id, const EntryNode& node, const std::vector<NMX::Slot>& slots);
  [[nodiscard]] std::map<TSubjectStoreId, std::string> ObjectsInSlots(TSubjectStoreId character) const;
  /// The slot that the subject fills as an object; the invalid id when it does not.
  [[nodiscard]] TSubjectStoreId SlotOf(TSubjectStoreId id) const;

  template <class T>
  [[nodiscard]] T Get(TSubjectStoreId id, NMX::EntryPath path) const
  {
    const NMX::Value* value = nullptr;
    Check(m_store.Find(id, path, value));
    const T* typed = value != nullptr ? std::get_if<T>(value) : nullptr;
    return typed != nullptr ? *typed : T{};
  }

  ElementWriter& m_xml;
  const IStoreReader& m_store;
  const std::set<TSubjectStoreId> m_subjects;
};

void SubjectWriter::Write(TSubjectStoreId id)
{
  NMX::ESubjectKind kind{};
  Check(m_store.Kind(id, kind));
  const auto name = Get<std::string>(id, Paths::Name());
  if (!Store::NameRule::Allows(name))
    throw ConfigurationError("subject " + Quoted(name) + ": that is no name for a subject any more, rename it");
  ElementWriter::Attributes attributes{{"kind", std::string(NMX::KindKey(kind))}, {"name", name}};
  if (const auto parent = Get<TSubjectStoreId>(id, Paths::ParentSubjectId());
      m_subjects.contains(parent) && !SlotOf(id).Valid())
    attributes.emplace_back("parent", Get<std::string>(parent, Paths::Name()));
  try
  {
    m_xml.Open("Subject", attributes);
    WriteEntries(id, EntriesOf(kind));
    m_xml.Close();
  }
  catch (const ConfigurationError& failure)
  {
    throw ConfigurationError("subject " + Quoted(name) + ": " + failure.what(), failure.Result());
  }
}

void SubjectWriter::WriteEntries(TSubjectStoreId id, const EntryNode& node)
{
  for (const EntryNode& child : node.children)
  {
    if (child.entry == nullptr)
    {
      m_xml.Open(child.name);
      WriteEntries(id, child);
      m_xml.CloseUnlessEmpty();
      continue;
    }
    const NMX::Value* value = nullptr;
    Check(m_store.Find(id, child.entry->path, value));
    if (value != nullptr && !std::holds_alternative<std::monostate>(*value) && *value != child.entry->initial)
      WriteEntry(id, child, *value);
  }
}

void SubjectWriter::WriteEntry(TSubjectStoreId id, const EntryNode& node, const NMX::Value& value)
{
  if (const std::string problem = NMX::ValueLimits::Problem(value); !problem.empty())
    throw ConfigurationError(Tag(node.name) + ' ' + problem);
  switch (node.entry->type)
  {
  case EValueType::Positions:
    return WriteMarkers(m_xml, node.name, std::get<std::vector<NMX::Position>>(value));
  case EValueType::SmartClusters:
    m_xml.Open(node.name);
    for (const NMX::SmartCluster& cluster : std::get<std::vector<NMX::SmartCluster>>(value))
      m_xml.Add("SmartCluster", {{"label", cluster.label},
                                 {"device", cluster.deviceUrn},
                                 {"pattern", TextOf(cluster.pattern)},
                                 {"type", cluster.type}});
    return m_xml.Close();
  case EValueType::Slots:
    return WriteSlots(id, node, std::get<std::vector<NMX::Slot>>(value));
  default:
    m_xml.AddText(node.name, TextOf(value));
  }
}

void SubjectWriter::WriteSlots(TSubjectStoreId id, const EntryNode& node, const std::vector<NMX::Slot>& slots)
{
  const auto objects = ObjectsInSlots(id);
  m_xml.Open(node.name);
  for (const NMX::Slot& slot : slots)
  {
    ElementWriter::Attributes attributes{{"name", slot.name}};
    if (const auto object = objects.find(slot.id); object != objects.end())
      attributes.emplace_back("object", object->second);
    m_xml.Add("Slot", attributes);
  }
  m_xml.Close();
}

std::map<TSubjectStoreId, std::string> SubjectWriter::ObjectsInSlots(TSubjectStoreId character) const
{
  std::map<TSubjectStoreId, std::string> objects;
  std::vector<TSubjectStoreId> children;
  Check(m_store.Children(character, children));
  for (const TSubjectStoreId child : children)
    if (const TSubjectStoreId slot = SlotOf(child); slot.Valid())
      objects.emplace(slot, Get<std::string>(child, Paths::Name()));
  return objects;
}

TSubjectStoreId SubjectWriter::SlotOf(TSubjectStoreId id) const
{
  std::uint32_t object = 0;
  Check(m_store.ObjectKind(id, object));
  const auto parent = Get<TSubjectStoreId>(id, Paths::ParentSubjectId());
  if (object == 0 || !m_subjects.contains(parent))
    return {};
  const auto slot = Get<TSubjectStoreId>(id, Paths::ParentSubjectSlotId());
  const auto slots = Get<std::vector<NMX::Slot>>(parent, Paths::Slots());
  return std::ranges::find(slots, slot, &NMX::Slot::id) != slots.end() ? slot : TSubjectStoreId{};
}

void AddSubjects(ElementWriter& xml, const IStoreReader& store, const std::vector<TSubjectStoreId>& subjects)
{
  SubjectWriter writer(xml, store, subjects);
  xml.Open("Subjects");
  for (const TSubjectStoreId id : subjects)
    writer.Write(id);
  xml.CloseUnlessEmpty();
}

}

std::string ConfigurationText(const IStoreReader& store)
{
  std::vector<TSubjectStoreId> subjects;
  for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
  {
    std::vector<TSubjectStoreId> ids;
    Check(store.Subjects(kind, ids));
    subjects.insert(subjects.end(), ids.begin(), ids.end());
  }
  ElementWriter xml("SubjectConfiguration");
  AddDevices(xml, store);
  AddPresets(xml, store);
  AddSubjects(xml, store, subjects);
  return xml.Finish();
}

std::string ConfigurationText(const IStoreReader& store, TSubjectStoreId subject)
{
  std::vector<TSubjectStoreId> subjects;
  if (store.Descendants(subject, subjects) == NMX::EResult::InvalidId)
    throw ConfigurationError("there is no such subject", NMX::EResult::InvalidId);
  ElementWriter xml("SubjectConfiguration");
  AddSubjects(xml, store, subjects);
  return xml.Finish();
}

}
