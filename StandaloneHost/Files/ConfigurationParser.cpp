#include "StandaloneHost/Files/ConfigurationParser.h"

#include "StandaloneHost/Files/ElementParts.h"
#include "StandaloneHost/Files/ElementReader.h"
#include "StandaloneHost/Files/EntryTree.h"
#include "StandaloneHost/Files/ValueText.h"
#include "StoreInterface/ValueLimits.h"

#include <algorithm>
#include <array>
#include <utility>

namespace Files
{

using NMX::EValueType;

namespace
{

std::string OptionalAttribute(const Element& element, std::string_view attribute)
{
  const std::string* text = element.Attribute(attribute);
  return text != nullptr ? *text : std::string{};
}

class Parser
{
public:
  Parser(const std::filesystem::path& file, ConfigurationContent& content) : m_xml(file), m_content(content) {}

  void Parse();

private:
  void ReadDevice(const Element& element);
  void ReadPreset(const Element& element);
  void ReadSubject(const Element& element);
  void ReadEntries(const EntryNode& node, std::vector<EntryContent>& entries, std::vector<FillingContent>& fillings);
  NMX::Value ReadEntry(const Element& element, EValueType type, std::vector<FillingContent>& fillings);
  std::vector<NMX::SmartCluster> ReadClusters();
  std::vector<NMX::Slot> ReadSlots(std::vector<FillingContent>& fillings);

  ElementReader m_xml;
  ConfigurationContent& m_content;
};

void Parser::Parse()
{
  const Element root = EnterFirstVersion(m_xml, "SubjectConfiguration");
  const auto each = [this](std::string_view name, void (Parser::*read)(const Element&))
  {
    return [this, name, read](const Element& /*section*/)
    { ForEachChild(m_xml, name, [this, read](const Element& element) { (this->*read)(element); }); };
  };
  ReadSections(m_xml, root,
               {{"Devices", EPresence::Optional, each("Device", &Parser::ReadDevice)},
                {"Presets", EPresence::Optional, each("Preset", &Parser::ReadPreset)},
                {"Subjects", EPresence::Optional, each("Subject", &Parser::ReadSubject)}});
  m_xml.End();
}

void Parser::ReadDevice(const Element& element)
{
  element.AllowAttributes({"urn", "type", "connected", "charging", "battery", "radio"});
  DeviceContent device{element.place,
                       element.FilledAttribute("urn"),
                       element.FilledAttribute("type"),
                       ReadAttribute<bool>(element, "connected"),
                       ReadAttribute<bool>(element, "charging"),
                       ReadAttribute<std::uint32_t>(element, "battery"),
                       ReadAttribute<std::uint32_t>(element, "radio")};
  if (device.urn.find('/') != std::string::npos)
    Fail(element.place, "the urn is " + Quoted(device.urn) + ", expected a text without \"/\"");
  if (device.battery > 100)
    Fail(element.place, "the battery has " + std::to_string(device.battery) + " percent, expected at most 100");
  m_xml.LeaveEmpty();
  m_content.devices.push_back(std::move(device));
}

void Parser::ReadPreset(const Element& element)
{
  element.AllowAttributes({"id", "name", "readOnly"});
  PresetContent preset{element.place,
                       ReadAttribute<std::uint32_t>(element, "id"),
                       element.FilledAttribute("name"),
                       ReadAttribute<bool>(element, "readOnly"),
                       {}};
  if (preset.id == 0)
    Fail(element.place, "the id of the preset is 0, expected at least 1");
  std::vector<FillingContent> none;
  ReadEntries(PresetParameters(), preset.parameters, none);
  m_content.presets.push_back(std::move(preset));
}

void Parser::ReadSubject(const Element& element)
{
  element.AllowAttributes({"kind", "name", "parent"});
  const std::string& key = element.RequiredAttribute("kind");
  const auto kind = NMX::KindFromKey(key);
  if (!kind)
  {
    std::array<std::string_view, NMX::allSubjectKinds.size()> keys;
    std::transform(NMX::allSubjectKinds.begin(), NMX::allSubjectKinds.end(), keys.begin(), NMX::KindKey);
    Fail(element.place, "the kind is " + Quoted(key) + ", " + Expected(keys));
  }
  SubjectContent subject{element.place, *kind, element.RequiredAttribute("name"), {}, {}, {}};
  if (element.Attribute("parent") != nullptr)
    subject.parent = element.FilledAttribute("parent");
  ReadEntries(EntriesOf(*kind), subject.entries, subject.fillings);
  m_content.subjects.push_back(std::move(subject));
}

void Parser::ReadEntries(const EntryNode& node, std::vector<EntryContent>& entries,
                         std::vector<FillingContent>& fillings)
{
  Once once;
  while (const auto element = m_xml.EnterChild())
  {
    const EntryNode* child = node.Find(element->name);
    if (child == nullptr)
      FailUnknown(*element, node.ChildNames());
    once.Check(element->place, Tag(element->name), element->name);
    element->AllowAttributes({});
    if (child->entry == nullptr)
      ReadEntries(*child, entries, fillings);
    else
      entries.push_back({element->place, child->entry->path, ReadEntry(*element, child->entry->type, fillings)});
  }
}

NMX::Value Parser::ReadEntry(const Element& element, EValueType type, std::vector<FillingContent>& fillings)
{
  switch (type)
  {
  case EValueType::Positions:
    return ReadMarkers(m_xml);
  case EValueType::SmartClusters:
    return ReadClusters();
  case EValueType::Slots:
    return ReadSlots(fillings);
  default:
    return ReadValue(type, element.place, Tag(element.name), m_xml.LeaveWithText());
  }
}

std::vector<NMX::SmartCluster> Parser::ReadClusters()
{
  std::vector<NMX::SmartCluster> clusters;
  constexpr ListForm clusterList{"SmartCluster", "cluster", NMX::ValueLimits::elements};
  ForEachOf(m_xml, clusterList,
            [&](const Element& element)
            {
              element.AllowAttributes({"label", "device", "pattern", "type"});
              clusters.push_back({element.RequiredAttribute("label"), OptionalAttribute(element, "device"),
                                  ReadAttribute<std::uint32_t>(element, "pattern"), element.RequiredAttribute("type")});
              m_xml.LeaveEmpty();
            });
  return clusters;
}

std::vector<NMX::Slot> Parser::ReadSlots(std::vector<FillingContent>& fillings)
{
  std::vector<NMX::Slot> slots;
  constexpr ListForm slotList{"Slot", "slot", NMX::ValueLimits::elements};
  ForEachOf(m_xml, slotList,
            [&](const Element& element)
            {
              element.AllowAttributes({"name", "object"});
              const NMX::TSubjectStoreId id(slots.size() + 1);
              slots.push_back({id, element.RequiredAttribute("name")});
              if (element.Attribute("object") != nullptr)
                fillings.push_back({element.place, id, element.FilledAttribute("object")});
              m_xml.LeaveEmpty();
            });
  return slots;
}

}

void ParseConfiguration(const std::filesystem::path& file, ConfigurationContent& content)
{
  Parser(file, content).Parse();
}

}
