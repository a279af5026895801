#pragma once

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StoreInterface/IStore.h"

#include <cstddef>
#include <filesystem>
#include <span>

// Files of subjects, read into the store and written from it. What is read is one edit: when anything is wrong, the
// store is untouched. What is written appears whole or stays as it was. All throw ConfigurationError. The calling
// thread holds no access to the store. [any]
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

/// Reads all files and adds what they hold to the store. Subjects may refer to subjects of any of the files.
ConfigurationCounts LoadSubjectConfigurations(NMX::IStore& store, std::span<const std::filesystem::path> files);

/// Puts what the file holds in the place of all subjects and presets. A device that is there stays as it is, the others
/// are added. Nobody is being calibrated afterwards, whatever the file says.
ConfigurationCounts ReplaceSubjectConfiguration(NMX::IStore& store, const std::filesystem::path& file);

/// Adds the subjects of a file that has nothing else. `AlreadyPresent` for a name that is in use, unless `overwrite`:
/// then the subject that has it is removed first. Nobody of the added is being calibrated.
void ImportSubjects(NMX::IStore& store, const std::filesystem::path& file, bool overwrite);

/// Writes all subjects, devices and presets.
void SaveSubjectConfiguration(const NMX::IStore& store, const std::filesystem::path& file);

/// Writes the subject and everything beneath it. `InvalidId` when there is no such subject.
void ExportSubject(const NMX::IStore& store, NMX::TSubjectStoreId subject, const std::filesystem::path& file);

}
