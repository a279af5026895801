#include "StandaloneHost/SmartObjects/TemplateFile.h"

#include "StandaloneHost/Files/ElementParts.h"
#include "StandaloneHost/Files/ElementReader.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <string_view>

namespace SmartObjects
{

using Files::Element;
using Files::ElementReader;

namespace
{

constexpr std::size_t maximumTemplateBytes = std::size_t{1} << 20;
constexpr std::size_t maximumClusters = 64;

std::vector<ClusterTemplate> ReadClusters(ElementReader& xml, const Element& section)
{
  std::vector<ClusterTemplate> clusters;
  Files::Once once;
  Files::ForEachChild(xml, "SmartCluster",
                      [&](const Element& element)
                      {
                        if (clusters.size() == maximumClusters)
                          Files::Fail(element.place,
                                      "one cluster too many, expected at most " + std::to_string(maximumClusters));
                        element.AllowAttributes({"label", "type"});
                        const std::string& label = element.FilledAttribute("label");
                        once.Check(element.place, "label " + Files::Quoted(label), label);
                        clusters.push_back({label, element.FilledAttribute("type")});
                        xml.LeaveEmpty();
                      });
  if (clusters.empty())
    Files::Fail(section.place, Files::Tag(section.name) + " is empty, expected at least one SmartCluster");
  return clusters;
}

}

SmartObjectTemplate ReadTemplate(const std::filesystem::path& file)
{
  ElementReader xml(file, maximumTemplateBytes);
  const Element root = Files::EnterFirstVersion(xml, "SmartObjectTemplate");

  constexpr std::array<std::string_view, 2> sections{"SmartClusters", "AdditionalMarkerPositions"};
  SmartObjectTemplate content;
  Files::Once once;
  while (const auto section = xml.EnterChild())
  {
    if (std::find(sections.begin(), sections.end(), section->name) == sections.end())
      Files::FailUnknown(*section, sections);
    once.Check(section->place, Files::Tag(section->name), section->name);
    section->AllowAttributes({});
    if (section->name == "SmartClusters")
      content.clusters = ReadClusters(xml, *section);
    else
      content.additionalMarkers = Files::ReadMarkers(xml);
  }
  xml.End();
  if (content.clusters.empty())
    Files::Fail(root.place, Files::Tag(root.name) + " lacks an element, expected SmartClusters");
  return content;
}

}
