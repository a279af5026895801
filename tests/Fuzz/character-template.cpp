// A character template: a file either reads as what a template promises, or is refused with its name.

#include "StandaloneHost/Characters/TemplateFile.h"
#include "tests/Fuzz/SoundSegments.h"
#include "tests/Fuzz/TemplateTarget.h"

#include <set>
#include <string_view>

namespace
{

bool Sound(const Characters::CharacterTemplate& read)
{
  const std::set<std::string_view> segments = SoundSegmentNames(read.segments);
  std::set<std::string_view> slots;
  for (const auto& [name, segment] : read.slots)
    if (name.empty() || !segments.contains(segment) || !slots.insert(name).second)
      return false;
  return !segments.empty() && !slots.empty() && slots.size() <= 256;
}

}

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size)
{
  return ReadsSoundOrRefuses(data, size, Characters::ReadTemplate, Sound);
}
