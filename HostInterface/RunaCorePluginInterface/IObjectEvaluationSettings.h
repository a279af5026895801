#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"
#include "HostInterface/NMX/ITypedId.h"

#include <cstdint>
#include <functional>

namespace NMX
{
class IStoreReader;
}

namespace RunaCorePluginInterface
{

/// The host's object evaluation: compares the marker layouts of the objects that are enabled with one another, in the
/// background, and warns of those that could be confused. This is how it is set and what it has found. [any]
///
/// No operation waits for a comparison.
class IObjectEvaluationSettings
{
public:
  IObjectEvaluationSettings() = default;
  IObjectEvaluationSettings(const IObjectEvaluationSettings&) = delete;
  IObjectEvaluationSettings& operator=(const IObjectEvaluationSettings&) = delete;
  virtual ~IObjectEvaluationSettings() = default;

  virtual NMX::IResult Enabled(bool& enabled) const = 0;

  /// Switching it off stops it at once and clears its warnings.
  virtual NMX::IResult SetEnabled(bool enabled) = 0;

  /// How many steps a comparison of two objects may take. `InvalidValue` for 0.
  virtual NMX::IResult MaximumEvaluationStepCount(std::uint64_t& count) const = 0;
  virtual NMX::IResult SetMaximumEvaluationStepCount(std::uint64_t count) = 0;

  /// Match distance in mm below which is warned. `InvalidValue` unless it is finite and not negative.
  virtual NMX::IResult WarningThreshold(double& threshold) const = 0;
  virtual NMX::IResult SetWarningThreshold(double threshold) = 0;

  /// Comparisons done and required in this update; both 0 after a change that follows a finished one, until it is known
  /// what the change makes necessary. `NotAvailable` while evaluation is off.
  virtual NMX::IResult Progress(std::uint64_t& done, std::uint64_t& required) const = 0;

  /// `NotAvailable` while evaluation is off.
  virtual NMX::IResult HighestStepCountReached(std::uint64_t& count) const = 0;

  /// Whether the first object matches the second, or another view of itself when both are the same, and the mean
  /// displacement in mm of the closest match, as far as it is known; the greatest finite number without a match.
  ///
  /// `access` is the read access by which the objects were found; it tells whether they are as they were compared.
  /// `NotAvailable` while evaluation is off, `NotFound` for an object that is not in the store, `NotRequired` for one
  /// that is disabled, `NotSupported` for one that cannot be compared.
  virtual NMX::IResult MatchDistance(const NMX::IStoreReader& access, NMX::TSubjectStoreId first,
                                     NMX::TSubjectStoreId second, bool& matches, double& distance) const = 0;

  /// Calls `handler` whenever a setting, the progress or a finding has changed, for as long as the returned
  /// subscription lives. It is called on any thread, perhaps once more while the subscription ends, and has to be
  /// brief.
  [[nodiscard]] virtual NMX::Subscription OnChange(std::function<void()> handler) = 0;
};

}
