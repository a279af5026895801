#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StoreInterface/EntryPath.h"
#include "StoreInterface/SubjectKind.h"
#include "StoreInterface/Value.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace Files
{

/// One device of the stage.
struct DeviceContent
{
  Place place;
  std::string urn;
  std::string type;
  bool connected = false;
  bool charging = false;
  std::uint32_t battery = 0; ///< percent
  std::uint32_t radio = 0;   ///< the radio channel, 0 when there is none
};

struct EntryContent
{
  Place place;
  NMX::EntryPath path;
  NMX::Value value;
};

/// A slot that is not empty.
struct FillingContent
{
  Place place;
  NMX::TSubjectStoreId slot;
  std::string object;
};

struct PresetContent
{
  Place place;
  std::uint32_t id = 0;
  std::string name;
  bool readOnly = false;
  std::vector<EntryContent> parameters; ///< by their paths in a subject
};

struct SubjectContent
{
  Place place;
  NMX::ESubjectKind kind{};
  std::string name;
  std::optional<std::string> parent;
  std::vector<EntryContent> entries;
  std::vector<FillingContent> fillings;
};

/// What configuration files say, each thing checked by itself, but not yet against the others.
struct ConfigurationContent
{
  std::vector<DeviceContent> devices;
  std::vector<PresetContent> presets;
  std::vector<SubjectContent> subjects;
};

}
