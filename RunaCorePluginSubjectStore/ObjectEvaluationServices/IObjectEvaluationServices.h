#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <memory>
#include <string>

namespace NMX
{

/// Object evaluation: finds objects, basic or smart, that could be confused with another, or with another view of
/// themselves. Which do is told by their warnings.
///
/// Outputs are untouched, and nothing has changed, when an operation fails. Operations never throw, and never wait for
/// a comparison. Every one answers `NotSupported` in a host that does not evaluate objects.
class IObjectEvaluationServices
{
public:
  using ChangedCallback = IMultiCallbackPostal<void()>;

  virtual ~IObjectEvaluationServices() = default;

  virtual IResult Enabled(bool& enabled) const = 0;
  virtual IResult SetEnabled(bool enabled) = 0;

  /// The most steps that the comparison of two objects may take. `InvalidValue` for 0.
  virtual IResult MaximumEvaluationStepCount(std::uint64_t& maximumStepCount) const = 0;
  virtual IResult SetMaximumEvaluationStepCount(std::uint64_t maximumStepCount) = 0;

  /// The match distance in mm below which is warned. `InvalidValue` unless it is finite and not negative.
  virtual IResult WarningThreshold(double& threshold) const = 0;
  virtual IResult SetWarningThreshold(double threshold) = 0;

  /// Comparisons done and required in this update. `NotAvailable` while evaluation is disabled.
  virtual IResult Progress(std::uint64_t& done, std::uint64_t& required) const = 0;

  /// `NotAvailable` while evaluation is disabled.
  virtual IResult HighestStepCountReached(std::uint64_t& highestStepCountReached) const = 0;

  /// Whether the first object, by its entrance threshold, matches the second, and the mean displacement in mm of the
  /// closest match; the greatest finite number when there is none, or none is known yet. `InvalidArgument` for a name
  /// that is not that of an object, `NotAvailable` while evaluation is disabled, `NotRequired` when either object is.
  virtual IResult MatchDistance(const std::string& firstObjectName, const std::string& secondObjectName, bool& matches,
                                double& matchDistance) const = 0;

  /// Raised whenever a setting, the progress or the warnings of object evaluation have changed.
  virtual std::shared_ptr<ChangedCallback> EvaluationChangedCallback() = 0;
};

}
