#pragma once

#include <cstdint>

namespace NMX
{

/// Characters built from clusters: slots that objects fill.
class ICharacterFromClustersServices
{
public:
  enum class ECharacterWarning : std::uint32_t
  {
    SlotObjectWarning,
    NotCalibrated,
    CFCNoReferenceClusterAssigned,
    InsufficientAutoAssignCandidates
  };

  enum class ECharacterCalibrationState : std::uint32_t
  {
    Uncalibrated,
    Calibrating,
    Calibrated
  };

  virtual ~ICharacterFromClustersServices() = default;
};

}
