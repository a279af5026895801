#pragma once

#include "StoreInterface/EntryPath.h"
#include "StoreInterface/IStoreReader.h"

#include <cstdint>

namespace Evaluation
{

/// How objects are evaluated. Kept in the store, so that it lasts.
struct EvaluationSettings
{
  bool enabled = false;
  std::uint64_t maximumSteps = 10'000;
  double warningThreshold = 5.0; ///< mm

  friend bool operator==(const EvaluationSettings&, const EvaluationSettings&) = default;

  /// How far (mm) from its counterpart a marker of a match may be: well beyond what is warned of.
  [[nodiscard]] double Reach() const;
};

/// Where the settings are kept. What is missing there, or is nothing that could be set, has its default value.
namespace SettingPaths
{
inline constexpr const char* all = "Application/Settings/ObjectEvaluation/*";
[[nodiscard]] NMX::EntryPath Enabled();
[[nodiscard]] NMX::EntryPath MaximumStepCount();
[[nodiscard]] NMX::EntryPath WarningThreshold();
}

[[nodiscard]] EvaluationSettings ReadSettings(const NMX::IStoreReader& reader);

[[nodiscard]] bool IsMaximumStepCount(std::uint64_t count);
[[nodiscard]] bool IsWarningThreshold(double threshold);

}
