#pragma once

#include <cstdint>
#include <string>
#include <vector>

/// Where the host keeps files of each sort. [any]
class IFileLocations
{
public:
  static constexpr std::uint32_t smartObjectTemplates = 1024;

  IFileLocations() = default;
  IFileLocations(const IFileLocations&) = delete;
  IFileLocations& operator=(const IFileLocations&) = delete;
  virtual ~IFileLocations() = default;

  /// The folders of a location, in the order in which they are searched; none for an unknown location.
  [[nodiscard]] virtual std::vector<std::wstring> Directories(std::uint32_t location) const = 0;
};
