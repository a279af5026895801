#pragma once

#include "StandaloneHost/Files/ElementReader.h"
#include "StandaloneHost/Files/ValueText.h"
#include "StoreInterface/Value.h"

#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace Files
{

/// Notices what may stand only once among its siblings. [any]
class Once
{
public:
  /// `what` names the thing in messages, `key` tells it from others.
  void Check(const Place& place, std::string_view what, std::string_view key);

private:
  std::map<std::string, Place, std::less<>> m_places;
};

template <class T>
[[nodiscard]] T ReadAttribute(const Element& element, std::string_view attribute)
{
  return ReadAs<T>(element.place, "attribute " + Quoted(attribute) + " of " + Tag(element.name),
                   element.RequiredAttribute(attribute));
}

/// Enters the file's outermost element, which must have that name, and version 1 as its only attribute.
Element EnterFirstVersion(ElementReader& xml, std::string_view name);

/// Reads each child of the element that was entered last; all have that name.
template <class ReadChild>
void ForEachChild(ElementReader& xml, std::string_view name, ReadChild readChild)
{
  while (const auto child = xml.EnterChild())
  {
    if (child->name != name)
      FailUnknown(*child, {&name, 1});
    readChild(*child);
  }
}

/// The places of the markers that the element that was entered last consists of.
[[nodiscard]] std::vector<NMX::Position> ReadMarkers(ElementReader& xml);

}
