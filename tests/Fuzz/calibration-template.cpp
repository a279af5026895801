// A labelling template and a subject skin: a file either reads as what each promises, or is refused with its name.

#include "StandaloneHost/Calibration/LabellingTemplateFile.h"
#include "StandaloneHost/Calibration/SubjectSkinFile.h"
#include "tests/Fuzz/SoundSegments.h"
#include "tests/Fuzz/TemplateTarget.h"

#include <set>
#include <string_view>

namespace
{

bool SoundTemplate(const Calibration::LabellingTemplate& read)
{
  std::set<std::string_view> children;
  for (const auto& [kind, name, parent] : read.children)
  {
    if (kind != NMX::ESubjectKind::Props && kind != NMX::ESubjectKind::LabellingClusters)
      return false;
    if (!parent.empty() && !children.contains(parent))
      return false;
    if (name.empty() || !children.insert(name).second)
      return false;
  }
  return children.size() <= 64 && !SoundSegmentNames(read.segments).empty();
}

bool SoundSkin(const Calibration::SubjectSkin& read)
{
  return !SoundSegmentNames(read.segments).empty();
}

}

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size)
{
  ReadsSoundOrRefuses(data, size, Calibration::ReadLabellingTemplate, SoundTemplate);
  return ReadsSoundOrRefuses(data, size, Calibration::ReadSubjectSkin, SoundSkin);
}
