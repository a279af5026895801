#include "StandaloneHost/Evaluation/EvaluationSettings.h"

#include "StandaloneHost/Evaluation/MarkerLayout.h"
#include "StoreInterface/EntryPaths.h"

#include <algorithm>
#include <cmath>

namespace Evaluation
{

namespace
{

/// Reads an entry that holds a `T` which `allowed` allows.
template <class T, class Allowed>
void ReadSetting(const NMX::IStoreReader& reader, NMX::EntryPath path, Allowed allowed, T& setting)
{
  const NMX::Value* value = reader.FindApplicationEntry(path);
  const T* typed = value != nullptr ? std::get_if<T>(value) : nullptr;
  if (typed != nullptr && allowed(*typed))
    setting = *typed;
}

}

double EvaluationSettings::Reach() const
{
  constexpr double least = 10;
  return std::clamp(2 * warningThreshold, least, largestCoordinate);
}

NMX::EntryPath SettingPaths::Enabled()
{
  return NMX::Paths::PathConstant<"Application/Settings/ObjectEvaluation/Enabled">();
}

NMX::EntryPath SettingPaths::MaximumStepCount()
{
  return NMX::Paths::PathConstant<"Application/Settings/ObjectEvaluation/MaximumStepCount">();
}

NMX::EntryPath SettingPaths::WarningThreshold()
{
  return NMX::Paths::PathConstant<"Application/Settings/ObjectEvaluation/WarningThreshold">();
}

EvaluationSettings ReadSettings(const NMX::IStoreReader& reader)
{
  EvaluationSettings settings;
  ReadSetting(reader, SettingPaths::Enabled(), [](bool) { return true; }, settings.enabled);
  ReadSetting(reader, SettingPaths::MaximumStepCount(), IsMaximumStepCount, settings.maximumSteps);
  ReadSetting(reader, SettingPaths::WarningThreshold(), IsWarningThreshold, settings.warningThreshold);
  return settings;
}

bool IsMaximumStepCount(std::uint64_t count)
{
  return count > 0;
}

bool IsWarningThreshold(double threshold)
{
  return std::isfinite(threshold) && threshold >= 0;
}

}
