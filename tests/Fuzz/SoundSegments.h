#pragma once

#include "StandaloneHost/Files/SegmentList.h"

#include <set>
#include <string_view>
#include <vector>

/// The names of the segments; none when these are not what a list of segments promises.
inline std::set<std::string_view> SoundSegmentNames(const std::vector<Files::Segment>& segments)
{
  std::set<std::string_view> names;
  for (const auto& [name, parent] : segments)
  {
    if (names.empty() ? !parent.empty() : !names.contains(parent))
      return {};
    if (name.empty() || !names.insert(name).second)
      return {};
  }
  return names.size() <= 256 ? names : std::set<std::string_view>{};
}
