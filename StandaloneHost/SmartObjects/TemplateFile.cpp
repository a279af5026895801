#include "StandaloneHost/SmartObjects/TemplateFile.h"

#include "StandaloneHost/Files/ElementParts.h"
#include "StandaloneHost/Files/ElementReader.h"
#include "StandaloneHost/Files/ElementWriter.h"

namespace SmartObjects
{

using Files::Element;
using Files::ElementReader;
using Files::EPresence;

namespace
{

constexpr Files::ListForm clusterList{"SmartCluster", "cluster", 64};

std::vector<ClusterTemplate> ReadClusters(ElementReader& xml, const Element& section)
{
  std::vector<ClusterTemplate> clusters;
  Files::Once once;
  Files::ForEachInList(xml, section, clusterList,
                       [&](const Element& element)
                       {
                         element.AllowAttributes({"label", "type"});
                         const std::string& label = element.FilledAttribute("label");
                         once.Check(element.place, "label " + Files::Quoted(label), label);
                         clusters.push_back({label, element.FilledAttribute("type")});
                         xml.LeaveEmpty();
                       });
  return clusters;
}

}

SmartObjectTemplate ReadTemplate(const std::filesystem::path& file)
{
  ElementReader xml(file, Files::maximumTemplateBytes);
  const Element root = Files::EnterFirstVersion(xml, "SmartObjectTemplate");
  SmartObjectTemplate content;
  Files::ReadSections(xml, root,
                      {{"SmartClusters", EPresence::Required,
                        [&](const Element& section) { content.clusters = ReadClusters(xml, section); }},
                       {"AdditionalMarkerPositions", EPresence::Optional,
                        [&](const Element& /*section*/) { content.additionalMarkers = Files::ReadMarkers(xml); }}});
  xml.End();
  return content;
}

std::string TemplateText(const SmartObjectTemplate& content)
{
  Files::ElementWriter xml("SmartObjectTemplate");
  xml.Open("SmartClusters");
  for (const ClusterTemplate& cluster : content.clusters)
    xml.Add("SmartCluster", {{"label", cluster.label}, {"type", cluster.type}});
  xml.Close();
  Files::WriteMarkers(xml, "AdditionalMarkerPositions", content.additionalMarkers);
  return xml.Finish();
}

}
