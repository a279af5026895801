#include "StandaloneHost/Characters/TemplateFile.h"

#include "StandaloneHost/Files/ElementParts.h"
#include "StandaloneHost/Files/ElementReader.h"
#include "StandaloneHost/Files/ElementWriter.h"

#include <algorithm>
#include <cstddef>
#include <utility>

namespace Characters
{

using Files::Element;
using Files::ElementReader;
using Files::EPresence;

namespace
{

constexpr Files::ListForm slotList{"Slot", "slot", 256};

class Reader
{
public:
  explicit Reader(const std::filesystem::path& file) : m_xml(file, Files::maximumTemplateBytes) {}

  CharacterTemplate Read();

private:
  void ReadSlots(const Element& section);
  void ReadRoles(const Element& section);
  void CheckSlots() const;

  ElementReader m_xml;
  CharacterTemplate m_content;
  std::vector<Files::Place> m_slotPlaces;
};

CharacterTemplate Reader::Read()
{
  const Element root = Files::EnterFirstVersion(m_xml, "CharacterTemplate");
  Files::ReadSections(m_xml, root,
                      {{"Segments", EPresence::Required,
                        [this](const Element& section) { m_content.segments = Files::ReadSegments(m_xml, section); }},
                       {"Slots", EPresence::Required, [this](const Element& section) { ReadSlots(section); }},
                       {"Roles", EPresence::Optional, [this](const Element& section) { ReadRoles(section); }}});
  m_xml.End();
  CheckSlots();
  return std::move(m_content);
}

void Reader::ReadSlots(const Element& section)
{
  Files::Once once;
  Files::ForEachInList(m_xml, section, slotList,
                       [&](const Element& element)
                       {
                         element.AllowAttributes({"name", "segment"});
                         const std::string& name = element.FilledAttribute("name");
                         once.Check(element.place, "slot " + Files::Quoted(name), name);
                         m_content.slots.push_back({name, element.FilledAttribute("segment")});
                         m_slotPlaces.push_back(element.place);
                         m_xml.LeaveEmpty();
                       });
}

/// Slots may stand before the segments that they are of.
void Reader::CheckSlots() const
{
  const auto& segments = m_content.segments;
  for (std::size_t index = 0; index < m_slotPlaces.size(); ++index)
    if (const std::string& segment = m_content.slots[index].segment;
        std::ranges::find(segments, segment, &Files::Segment::name) == segments.end())
      Files::Fail(m_slotPlaces[index],
                  "unknown segment " + Files::Quoted(segment) + ", expected the name of one of the template");
}

void Reader::ReadRoles(const Element& section)
{
  Files::ReadSections(m_xml, section,
                      {Files::TruthValue(m_xml, "Solving", m_content.solving),
                       Files::TruthValue(m_xml, "Retargeting", m_content.retargeting)});
}

}

CharacterTemplate ReadTemplate(const std::filesystem::path& file)
{
  return Reader(file).Read();
}

std::string TemplateText(const CharacterTemplate& content)
{
  Files::ElementWriter xml("CharacterTemplate");
  Files::WriteSegments(xml, content.segments);
  xml.Open("Slots");
  for (const SlotTemplate& slot : content.slots)
    xml.Add("Slot", {{"name", slot.name}, {"segment", slot.segment}});
  xml.Close();
  xml.Open("Roles");
  xml.AddText("Solving", Files::TextOf(content.solving));
  xml.AddText("Retargeting", Files::TextOf(content.retargeting));
  xml.Close();
  return xml.Finish();
}

}
