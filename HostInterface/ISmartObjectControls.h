#pragma once

#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

namespace NMX
{
class IStoreReader;
}

/// Makes smart objects and hands out active marker patterns: what a host knows of templates, devices and pattern sets.
/// Each operation does all of it, as one edit of the store, or nothing. [any]
class ISmartObjectControls
{
public:
  /// Whether a request is carried out, or only checked.
  enum class ECreate : bool
  {
    No,
    Yes
  };

  ISmartObjectControls() = default;
  ISmartObjectControls(const ISmartObjectControls&) = delete;
  ISmartObjectControls& operator=(const ISmartObjectControls&) = delete;
  virtual ~ISmartObjectControls() = default;

  /// Makes a smart object from a template file; each of its clusters gets a pattern of its own, if there is one left.
  /// `InvalidName`, `AlreadyPresent`; `FileNotFound` when there is no such file, `Failed` when it is not a file or
  /// cannot be read as a template: the log tells where and why.
  virtual NMX::IResult CreateFromTemplate(const std::string& name, const std::filesystem::path& file,
                                          ECreate create) = 0;

  /// Makes a smart object for each device that none is linked to, and answers their names. `NotFound` for a device of a
  /// type that smart objects cannot have, `AllocationFailure` when there are more devices than patterns left,
  /// `NotSupported` when no pattern set serves the types of cluster together.
  virtual NMX::IResult CreateForUnlinkedDevices(std::vector<std::string>& names) = 0;

  /// The same for these devices, or only a check of it. `AlreadyPresent` for one that is linked to a cluster, or comes
  /// twice; `InvalidArgument` without any.
  virtual NMX::IResult CreateForDevices(const std::vector<std::string>& urns, ECreate create,
                                        std::vector<std::string>& names) = 0;

  /// Gives every cluster a pattern of its own, from the smallest set that has enough; those beyond the largest get 0.
  /// `NotFound` for an unknown type of cluster, `NotSupported` as above.
  virtual NMX::IResult AssignOptimalPatterns() = 0;

  /// `InvalidValue` unless clusters of that type can be given that pattern at present, as `access` shows it; 0, no
  /// pattern, they always can.
  virtual NMX::IResult CheckPattern(const NMX::IStoreReader& access, const std::string& clusterType,
                                    std::uint32_t pattern) const = 0;
};
