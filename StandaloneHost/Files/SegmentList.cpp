#include "StandaloneHost/Files/SegmentList.h"

#include "StandaloneHost/Files/ElementParts.h"

#include <utility>

namespace Files
{

namespace
{

constexpr ListForm segmentList{"Segment", "segment", 256};

std::string ReadRootsParent(const Element& root)
{
  if (root.Attribute("parent") != nullptr)
    Fail(root.place, "the first segment has a parent, expected none as it is the root");
  return {};
}

std::string ReadParent(const Element& segment, const Once& before)
{
  const std::string& parent = segment.FilledAttribute("parent");
  if (!before.Seen(parent))
    Fail(segment.place, "unknown parent " + Quoted(parent) + ", expected the name of a segment that stands before");
  return parent;
}

}

std::vector<Segment> ReadSegments(ElementReader& xml, const Element& list)
{
  std::vector<Segment> segments;
  Once once;
  ForEachInList(xml, list, segmentList,
                [&](const Element& element)
                {
                  element.AllowAttributes({"name", "parent"});
                  const std::string& name = element.FilledAttribute("name");
                  std::string parent = segments.empty() ? ReadRootsParent(element) : ReadParent(element, once);
                  once.Check(element.place, "segment " + Quoted(name), name);
                  segments.push_back({name, std::move(parent)});
                  xml.LeaveEmpty();
                });
  return segments;
}

void WriteSegments(ElementWriter& xml, const std::vector<Segment>& segments)
{
  xml.Open("Segments");
  for (const Segment& segment : segments)
  {
    ElementWriter::Attributes attributes{{"name", segment.name}};
    if (!segment.parent.empty())
      attributes.emplace_back("parent", segment.parent);
    xml.Add("Segment", attributes);
  }
  xml.Close();
}

}
