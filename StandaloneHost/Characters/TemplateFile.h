#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StandaloneHost/Files/SegmentList.h"

#include <filesystem>
#include <string>
#include <vector>

namespace Characters
{

/// A slot that a character starts with, and the segment that the object in it is worn on.
struct SlotTemplate
{
  std::string name;
  std::string segment;

  friend bool operator==(const SlotTemplate&, const SlotTemplate&) = default;
};

/// What a new character starts with.
struct CharacterTemplate
{
  std::vector<Files::Segment> segments; ///< 1 to 256, the root first; no two have the same name
  std::vector<SlotTemplate> slots;      ///< 1 to 256; no two have the same name
  bool solving = true;
  bool retargeting = false;

  friend bool operator==(const CharacterTemplate&, const CharacterTemplate&) = default;
};

/// Reads a template file. Throws Files::UnreadableFileError when the file itself cannot be read, and another
/// Files::ConfigurationError when anything is wrong with its content. [any]
[[nodiscard]] CharacterTemplate ReadTemplate(const std::filesystem::path& file);

/// The text of a file from which ReadTemplate reads the same, if it can be read at all. Throws
/// Files::ConfigurationError for a text that no file can hold. [any]
[[nodiscard]] std::string TemplateText(const CharacterTemplate& content);

}
