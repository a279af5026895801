#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StoreInterface/Value.h"

#include <filesystem>
#include <string>
#include <vector>

namespace SmartObjects
{

/// A cluster that a smart object starts with: what it is called, and the device type that it is made for.
struct ClusterTemplate
{
  std::string label;
  std::string type;

  friend bool operator==(const ClusterTemplate&, const ClusterTemplate&) = default;
};

/// What a new smart object starts with. Markers are in mm, in the object's own frame.
struct SmartObjectTemplate
{
  std::vector<ClusterTemplate> clusters; ///< 1 to 64; no two have the same label
  std::vector<NMX::Position> additionalMarkers;

  friend bool operator==(const SmartObjectTemplate&, const SmartObjectTemplate&) = default;
};

/// Reads a template file. Throws Files::ConfigurationError when anything is wrong with it. [any]
[[nodiscard]] SmartObjectTemplate ReadTemplate(const std::filesystem::path& file);

/// The text of a file from which ReadTemplate reads the same, if it can be read at all. Throws
/// Files::ConfigurationError for a text that no file can hold. [any]
[[nodiscard]] std::string TemplateText(const SmartObjectTemplate& content);

}
