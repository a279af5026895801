#include "StandaloneHost/Characters/TemplateFile.h"

#include "StandaloneHost/Files/ElementParts.h"
#include "StandaloneHost/Files/ElementReader.h"
#include "StandaloneHost/Files/ValueText.h"

#include <cstddef>
#include <utility>

namespace Characters
{

using Files::Element;
using Files::ElementReader;
using Files::EPresence;

namespace
{

constexpr std::size_t maximumTemplateBytes = std::size_t{1} << 20;
constexpr Files::ListForm segmentList{"Segment", "segment", 256};
constexpr Files::ListForm slotList{"Slot", "slot", 256};

class Reader
{
public:
  explicit Reader(const std::filesystem::path& file) : m_xml(file, maximumTemplateBytes) {}

  CharacterTemplate Read();

private:
  void ReadSegments(const Element& section);
  std::string ReadParent(const Element& segment) const;
  void ReadSlots(const Element& section);
  void ReadRoles(const Element& section);
  [[nodiscard]] bool ReadRole(const Element& role);
  void CheckSlots() const;

  ElementReader m_xml;
  CharacterTemplate m_content;
  Files::Once m_segments;
  std::vector<Files::Place> m_slotPlaces;
};

CharacterTemplate Reader::Read()
{
  const Element root = Files::EnterFirstVersion(m_xml, "CharacterTemplate");
  Files::ReadSections(m_xml, root,
                      {{"Segments", EPresence::Required, [this](const Element& section) { ReadSegments(section); }},
                       {"Slots", EPresence::Required, [this](const Element& section) { ReadSlots(section); }},
                       {"Roles", EPresence::Optional, [this](const Element& section) { ReadRoles(section); }}});
  m_xml.End();
  CheckSlots();
  return std::move(m_content);
}

void Reader::ReadSegments(const Element& section)
{
  Files::ForEachInList(m_xml, section, segmentList,
                       [this](const Element& element)
                       {
                         element.AllowAttributes({"name", "parent"});
                         const std::string& name = element.FilledAttribute("name");
                         std::string parent = ReadParent(element);
                         m_segments.Check(element.place, "segment " + Files::Quoted(name), name);
                         m_content.segments.push_back({name, std::move(parent)});
                         m_xml.LeaveEmpty();
                       });
}

/// The segments known so far are those that stand before this one.
std::string Reader::ReadParent(const Element& segment) const
{
  if (m_content.segments.empty())
  {
    if (segment.Attribute("parent") != nullptr)
      Files::Fail(segment.place, "the first segment has a parent, expected none as it is the root");
    return {};
  }
  const std::string& parent = segment.FilledAttribute("parent");
  if (!m_segments.Seen(parent))
    Files::Fail(segment.place,
                "unknown parent " + Files::Quoted(parent) + ", expected the name of a segment that stands before");
  return parent;
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
  for (std::size_t index = 0; index < m_slotPlaces.size(); ++index)
    if (const std::string& segment = m_content.slots[index].segment; !m_segments.Seen(segment))
      Files::Fail(m_slotPlaces[index],
                  "unknown segment " + Files::Quoted(segment) + ", expected the name of one of the template");
}

void Reader::ReadRoles(const Element& section)
{
  Files::ReadSections(
      m_xml, section,
      {{"Solving", EPresence::Optional, [this](const Element& role) { m_content.solving = ReadRole(role); }},
       {"Retargeting", EPresence::Optional, [this](const Element& role) { m_content.retargeting = ReadRole(role); }}});
}

bool Reader::ReadRole(const Element& role)
{
  return Files::ReadAs<bool>(role.place, Files::Tag(role.name), m_xml.LeaveWithText());
}

}

CharacterTemplate ReadTemplate(const std::filesystem::path& file)
{
  return Reader(file).Read();
}

}
