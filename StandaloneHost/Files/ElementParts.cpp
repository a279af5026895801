#include "StandaloneHost/Files/ElementParts.h"

#include "StoreInterface/ValueLimits.h"

#include <algorithm>

namespace Files
{

void Once::Check(const Place& place, std::string_view what, std::string_view key)
{
  const auto [known, added] = m_places.emplace(key, place);
  if (!added)
    Fail(place, "repeated " + std::string(what) + ", expected it once (first at " + PlaceText(known->second) + ")");
}

Element EnterFirstVersion(ElementReader& xml, std::string_view name)
{
  Element root = xml.EnterRoot(name);
  root.AllowAttributes({"version"});
  if (const std::string& version = root.RequiredAttribute("version"); version != "1")
    Fail(root.place, "the version is " + Quoted(version) + ", expected 1");
  return root;
}

void ReadSections(ElementReader& xml, const Element& parent, std::initializer_list<Section> sections)
{
  std::vector<std::string_view> names;
  for (const Section& section : sections)
    names.push_back(section.name);
  Once once;
  while (const auto element = xml.EnterChild())
  {
    const auto named = std::find(names.begin(), names.end(), element->name);
    if (named == names.end())
      FailUnknown(*element, names);
    once.Check(element->place, Tag(element->name), element->name);
    element->AllowAttributes({});
    sections.begin()[named - names.begin()].read(*element);
  }
  for (const Section& section : sections)
    if (section.presence == EPresence::Required && !once.Seen(section.name))
      Fail(parent.place, Tag(parent.name) + " lacks an element, expected " + std::string(section.name));
}

Section TruthValue(ElementReader& xml, std::string_view name, bool& value)
{
  return {name, EPresence::Optional, [&xml, &value](const Element& element) {
            value = ReadAs<bool>(element.place, Tag(element.name), xml.LeaveWithText());
          }};
}

std::vector<NMX::Position> ReadMarkers(ElementReader& xml)
{
  std::vector<NMX::Position> markers;
  constexpr ListForm markerList{"Marker", "marker", NMX::ValueLimits::positions};
  ForEachOf(xml, markerList,
            [&](const Element& element)
            {
              element.AllowAttributes({"x", "y", "z"});
              markers.push_back({ReadAttribute<double>(element, "x"), ReadAttribute<double>(element, "y"),
                                 ReadAttribute<double>(element, "z")});
              xml.LeaveEmpty();
            });
  return markers;
}

void WriteMarkers(ElementWriter& xml, std::string_view name, const std::vector<NMX::Position>& markers)
{
  xml.Open(name);
  for (const NMX::Position& marker : markers)
    xml.Add("Marker", {{"x", TextOf(marker.x)}, {"y", TextOf(marker.y)}, {"z", TextOf(marker.z)}});
  xml.CloseUnlessEmpty();
}

}
