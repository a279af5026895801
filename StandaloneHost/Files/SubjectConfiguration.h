#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StoreInterface/IStore.h"

#include <cstddef>
#include <filesystem>
#include <span>

namespace Files
{

/// How much was loaded.
struct ConfigurationCounts
{
  std::size_t devices = 0;
  std::size_t presets = 0;
  std::size_t subjects = 0;

  friend bool operator==(const ConfigurationCounts&, const ConfigurationCounts&) = default;
};

/// Reads all files and adds what they hold to the store, in one edit. Subjects may refer to subjects of any of the
/// files. Throws ConfigurationError when anything is wrong; the store is untouched then. The calling thread holds no
/// access to the store. [any]
ConfigurationCounts LoadSubjectConfigurations(NMX::IStore& store, std::span<const std::filesystem::path> files);

}
