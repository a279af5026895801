#pragma once

#include <cstdint>
#include <string>
#include <vector>

/// Where the host keeps files of each sort. [any]
class IFileLocations
{
public:
  // The sorts. The numbers are the host's own.
  static constexpr std::uint32_t subjectTemplates = 1;
  static constexpr std::uint32_t characterTemplates = 2;
  static constexpr std::uint32_t retargets = 4;
  static constexpr std::uint32_t markerlessTemplates = 8;
  static constexpr std::uint32_t retargetSkins = 16;
  static constexpr std::uint32_t subjectSkins = 32;
  static constexpr std::uint32_t propSkins = 64;
  static constexpr std::uint32_t characterSkins = 128;
  static constexpr std::uint32_t subjectConfigurations = 256;
  static constexpr std::uint32_t subjects = 512;
  static constexpr std::uint32_t smartObjectTemplates = 1024;
  static constexpr std::uint32_t props = 2048;
  static constexpr std::uint32_t labellingClusters = 4096;
  static constexpr std::uint32_t objects = 8192;
  static constexpr std::uint32_t exports = 16384;

  IFileLocations() = default;
  IFileLocations(const IFileLocations&) = delete;
  IFileLocations& operator=(const IFileLocations&) = delete;
  virtual ~IFileLocations() = default;

  /// The folders of a location, in the order in which they are searched; none for an unknown location.
  [[nodiscard]] virtual std::vector<std::wstring> Directories(std::uint32_t location) const = 0;

  /// The folder of a location in which the user's own files are kept, which need not exist yet; empty for an unknown
  /// location, or where nothing is kept.
  [[nodiscard]] virtual std::wstring UserDirectory(std::uint32_t location) const = 0;
};
