// A smart-object template: a file either reads as what a template promises, or is refused with its name.

#include "StandaloneHost/SmartObjects/TemplateFile.h"
#include "tests/Fuzz/TemplateTarget.h"

#include <cmath>
#include <set>
#include <string_view>

namespace
{

bool Sound(const SmartObjects::SmartObjectTemplate& read)
{
  std::set<std::string_view> labels;
  for (const auto& [label, type] : read.clusters)
    if (label.empty() || type.empty() || !labels.insert(label).second)
      return false;
  for (const NMX::Position& marker : read.additionalMarkers)
    if (!std::isfinite(marker.x) || !std::isfinite(marker.y) || !std::isfinite(marker.z))
      return false;
  return !read.clusters.empty() && read.clusters.size() <= 64;
}

}

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size)
{
  return ReadsSoundOrRefuses(data, size, SmartObjects::ReadTemplate, Sound);
}
