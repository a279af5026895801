#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StandaloneHost/Files/SegmentList.h"
#include "StoreInterface/SubjectKind.h"

#include <filesystem>
#include <string>
#include <vector>

namespace Calibration
{

/// A subject that is created beneath a new one, such as what a person carries.
struct ChildTemplate
{
  NMX::ESubjectKind kind; ///< Props or LabellingClusters
  std::string name;
  std::string parent; ///< one of the children before it; empty when that is the new subject itself

  friend bool operator==(const ChildTemplate&, const ChildTemplate&) = default;
};

/// What the labelling of a new subject starts with.
struct LabellingTemplate
{
  std::vector<Files::Segment> segments; ///< 1 to 256, the root first; no two have the same name
  std::vector<ChildTemplate> children;  ///< up to 64; no two have the same name
  bool labelling = true;

  friend bool operator==(const LabellingTemplate&, const LabellingTemplate&) = default;
};

/// Reads a labelling template file. Throws Files::UnreadableFileError when the file itself cannot be read, and another
/// Files::ConfigurationError when anything is wrong with its content. [any]
[[nodiscard]] LabellingTemplate ReadLabellingTemplate(const std::filesystem::path& file);

/// The text of a file from which ReadLabellingTemplate reads the same, if it can be read at all. Throws
/// Files::ConfigurationError for a text that no file can hold. [any]
[[nodiscard]] std::string LabellingTemplateText(const LabellingTemplate& content);

}
