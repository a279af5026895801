#include "StandaloneHost/Calibration/LabellingTemplateFile.h"

#include "StandaloneHost/Files/ElementParts.h"
#include "StandaloneHost/Files/ElementReader.h"
#include "StandaloneHost/Files/ElementWriter.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>

namespace Calibration
{

using Files::Element;
using Files::ElementReader;
using Files::EPresence;
using NMX::ESubjectKind;

namespace
{

constexpr Files::ListForm childList{"Child", "child", 64};
constexpr std::array childKinds{ESubjectKind::Props, ESubjectKind::LabellingClusters};

ESubjectKind ReadKind(const Element& child)
{
  const std::string& key = child.RequiredAttribute("kind");
  const auto kind = std::find_if(childKinds.begin(), childKinds.end(),
                                 [&](ESubjectKind possible) { return NMX::KindKey(possible) == key; });
  if (kind == childKinds.end())
  {
    std::array<std::string_view, childKinds.size()> keys;
    std::transform(childKinds.begin(), childKinds.end(), keys.begin(), NMX::KindKey);
    Files::Fail(child.place, "the kind is " + Files::Quoted(key) + ", " + Files::Expected(keys));
  }
  return *kind;
}

std::string ReadParent(const Element& child, const Files::Once& before)
{
  if (child.Attribute("parent") == nullptr)
    return {};
  const std::string& parent = child.FilledAttribute("parent");
  if (!before.Seen(parent))
    Files::Fail(child.place,
                "unknown parent " + Files::Quoted(parent) + ", expected the name of a child that stands before");
  return parent;
}

std::vector<ChildTemplate> ReadChildren(ElementReader& xml, const Element& section)
{
  std::vector<ChildTemplate> children;
  Files::Once once;
  Files::ForEachInList(xml, section, childList,
                       [&](const Element& element)
                       {
                         element.AllowAttributes({"kind", "name", "parent"});
                         const ESubjectKind kind = ReadKind(element);
                         const std::string& name = element.FilledAttribute("name");
                         std::string parent = ReadParent(element, once);
                         once.Check(element.place, "child " + Files::Quoted(name), name);
                         children.push_back({kind, name, std::move(parent)});
                         xml.LeaveEmpty();
                       });
  return children;
}

}

LabellingTemplate ReadLabellingTemplate(const std::filesystem::path& file)
{
  ElementReader xml(file, Files::maximumTemplateBytes);
  const Element root = Files::EnterFirstVersion(xml, "LabellingTemplate");
  LabellingTemplate content;
  const auto readRoles = [&](const Element& section)
  { Files::ReadSections(xml, section, {Files::TruthValue(xml, "Labelling", content.labelling)}); };
  Files::ReadSections(xml, root,
                      {{"Segments", EPresence::Required,
                        [&](const Element& section) { content.segments = Files::ReadSegments(xml, section); }},
                       {"Children", EPresence::Optional,
                        [&](const Element& section) { content.children = ReadChildren(xml, section); }},
                       {"Roles", EPresence::Optional, readRoles}});
  xml.End();
  return content;
}

std::string LabellingTemplateText(const LabellingTemplate& content)
{
  Files::ElementWriter xml("LabellingTemplate");
  Files::WriteSegments(xml, content.segments);
  xml.Open("Children");
  for (const ChildTemplate& child : content.children)
  {
    Files::ElementWriter::Attributes attributes{{"kind", std::string(NMX::KindKey(child.kind))}, {"name", child.name}};
    if (!child.parent.empty())
      attributes.emplace_back("parent", child.parent);
    xml.Add("Child", attributes);
  }
  xml.CloseUnlessEmpty();
  xml.Open("Roles");
  xml.AddText("Labelling", Files::TextOf(content.labelling));
  xml.Close();
  return xml.Finish();
}

}
