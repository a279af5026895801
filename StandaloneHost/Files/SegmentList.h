#pragma once

#include "StandaloneHost/Files/ElementReader.h"
#include "StandaloneHost/Files/ElementWriter.h"

#include <string>
#include <vector>

namespace Files
{

/// A segment of the skeleton that a template or skin is made for.
struct Segment
{
  std::string name;
  std::string parent; ///< one of the segments before it; empty for the root

  friend bool operator==(const Segment&, const Segment&) = default;
};

/// Reads the segments that `list` consists of, which is the element that was entered last: 1 to 256, the root first,
/// no two with the same name. [any]
[[nodiscard]] std::vector<Segment> ReadSegments(ElementReader& xml, const Element& list);

/// Writes the element "Segments" from which ReadSegments reads these.
void WriteSegments(ElementWriter& xml, const std::vector<Segment>& segments);

}
