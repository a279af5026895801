#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StandaloneHost/Files/SegmentList.h"

#include <filesystem>
#include <vector>

namespace Calibration
{

/// What the solving of a new subject starts with.
struct SubjectSkin
{
  std::vector<Files::Segment> segments; ///< 1 to 256, the root first; no two have the same name
  bool solving = true;
  bool retargeting = false;
  bool cgm2 = false;
  bool pluginKinex = false;

  friend bool operator==(const SubjectSkin&, const SubjectSkin&) = default;
};

/// Reads a subject skin file. Throws Files::UnreadableFileError when the file itself cannot be read, and another
/// Files::ConfigurationError when anything is wrong with its content. [any]
[[nodiscard]] SubjectSkin ReadSubjectSkin(const std::filesystem::path& file);

}
