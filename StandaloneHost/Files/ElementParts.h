#pragma once

#include "StandaloneHost/Files/ElementReader.h"
#include "StandaloneHost/Files/ElementWriter.h"
#include "StandaloneHost/Files/ValueText.h"
#include "StoreInterface/Value.h"

#include <cstddef>
#include <functional>
#include <initializer_list>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace Files
{

/// How large a file may be that describes a single subject.
inline constexpr std::size_t maximumTemplateBytes = std::size_t{1} << 20;

/// Notices what may stand only once among its siblings. [any]
class Once
{
public:
  /// `what` names the thing in messages, `key` tells it from others.
  void Check(const Place& place, std::string_view what, std::string_view key);
  [[nodiscard]] bool Seen(std::string_view key) const { return m_places.contains(key); }

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

/// What the children of a list are: all have that element name, and there are at most `most`.
struct ListForm
{
  std::string_view element;
  std::string_view noun; ///< what messages call one of them
  std::size_t most;
};

/// Reads each child of a list, which is the element that was entered last.
template <class ReadChild>
std::size_t ForEachOf(ElementReader& xml, const ListForm& form, ReadChild readChild)
{
  std::size_t count = 0;
  ForEachChild(xml, form.element,
               [&](const Element& child)
               {
                 if (count++ == form.most)
                   Fail(child.place,
                        "one " + std::string(form.noun) + " too many, expected at most " + std::to_string(form.most));
                 readChild(child);
               });
  return count;
}

/// The same for a list that has at least one.
template <class ReadChild>
void ForEachInList(ElementReader& xml, const Element& list, const ListForm& form, ReadChild readChild)
{
  if (ForEachOf(xml, form, readChild) == 0)
    Fail(list.place, Tag(list.name) + " is empty, expected at least one " + std::string(form.element));
}

enum class EPresence
{
  Required,
  Optional
};

/// A child without attributes that an element has at most once, and what reads and leaves it.
struct Section
{
  std::string_view name;
  EPresence presence;
  std::function<void(const Element&)> read;
};

/// Reads the children of `parent`, which is the element that was entered last: these sections, in any order.
void ReadSections(ElementReader& xml, const Element& parent, std::initializer_list<Section> sections);

/// A section that may be left out, and whose text is a truth value. `value` outlives the section.
[[nodiscard]] Section TruthValue(ElementReader& xml, std::string_view name, bool& value);

/// The places of the markers that the element that was entered last consists of.
[[nodiscard]] std::vector<NMX::Position> ReadMarkers(ElementReader& xml);

/// Writes the element from which ReadMarkers reads these; none when there are no markers.
void WriteMarkers(ElementWriter& xml, std::string_view name, const std::vector<NMX::Position>& markers);

}
