#include "StandaloneHost/Evaluation/VObjectEvaluationEngine.h"

#include "StandaloneHost/Evaluation/ConfusionWarnings.h"
#include "StandaloneHost/Evaluation/EvaluationSettings.h"
#include "StandaloneHost/Evaluation/EvaluationWorker.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"

#include <limits>
#include <utility>

namespace Evaluation
{

using NMX::EResult;
using NMX::IResult;

VObjectEvaluationEngine::VObjectEvaluationEngine(std::shared_ptr<NMX::IStore> store)
    : m_store(std::move(store)), m_worker(std::make_unique<EvaluationWorker>(m_store))
{
}

VObjectEvaluationEngine::~VObjectEvaluationEngine() = default;

void VObjectEvaluationEngine::Stop()
{
  m_worker->Stop();
}

bool VObjectEvaluationEngine::IsEnabled() const
{
  return ReadSettings(*m_store->Reader()).enabled;
}

IResult VObjectEvaluationEngine::Set(NMX::EntryPath setting, NMX::Value value)
{
  const auto editor = m_store->Editor();
  if (const IResult written = editor->SetApplicationEntry(setting, std::move(value)); written.Failed())
    return written;
  return editor->Commit();
}

IResult VObjectEvaluationEngine::Enabled(bool& enabled) const
{
  enabled = IsEnabled();
  return EResult::Ok;
}

IResult VObjectEvaluationEngine::SetEnabled(bool enabled)
{
  const auto editor = m_store->Editor();
  if (enabled == ReadSettings(*editor).enabled)
    return EResult::Ok;
  if (const IResult written = editor->SetApplicationEntry(SettingPaths::Enabled(), enabled); written.Failed())
    return written;
  if (!enabled)
    if (const IResult cleared = ClearWarnings(*editor); cleared.Failed())
      return cleared;
  return editor->Commit();
}

IResult VObjectEvaluationEngine::MaximumEvaluationStepCount(std::uint64_t& count) const
{
  count = ReadSettings(*m_store->Reader()).maximumSteps;
  return EResult::Ok;
}

IResult VObjectEvaluationEngine::SetMaximumEvaluationStepCount(std::uint64_t count)
{
  return IsMaximumStepCount(count) ? Set(SettingPaths::MaximumStepCount(), count) : EResult::InvalidValue;
}

IResult VObjectEvaluationEngine::WarningThreshold(double& threshold) const
{
  threshold = ReadSettings(*m_store->Reader()).warningThreshold;
  return EResult::Ok;
}

IResult VObjectEvaluationEngine::SetWarningThreshold(double threshold)
{
  return IsWarningThreshold(threshold) ? Set(SettingPaths::WarningThreshold(), threshold) : EResult::InvalidValue;
}

IResult VObjectEvaluationEngine::Progress(std::uint64_t& done, std::uint64_t& required) const
{
  if (!IsEnabled())
    return EResult::NotAvailable;
  const Comparisons::Counts counts = m_worker->Progress();
  done = counts.done;
  required = counts.required;
  return EResult::Ok;
}

IResult VObjectEvaluationEngine::HighestStepCountReached(std::uint64_t& count) const
{
  if (!IsEnabled())
    return EResult::NotAvailable;
  count = m_worker->MostSteps();
  return EResult::Ok;
}

IResult VObjectEvaluationEngine::MatchDistance(const NMX::IStoreReader& access, NMX::TSubjectStoreId first,
                                               NMX::TSubjectStoreId second, bool& matches, double& distance) const
{
  if (!ReadSettings(access).enabled)
    return EResult::NotAvailable;
  EvaluationWorker::Seen seen[] = {{first, {}}, {second, {}}};
  for (auto& object : seen)
    if (access.Stamps(object.id, object.stamps).Failed())
      return EResult::NotFound;
  for (const auto& object : seen)
  {
    bool enabled = false;
    if (const IResult read = NMX::Read(access, object.id, NMX::Paths::Enabled(), enabled); read.Failed())
      return read;
    if (!enabled)
      return EResult::NotRequired;
  }
  bool comparable = true;
  const auto known = m_worker->Distance(seen[0], seen[1], comparable);
  if (!comparable)
    return EResult::NotSupported;
  matches = known.has_value();
  distance = known.value_or(std::numeric_limits<double>::max());
  return EResult::Ok;
}

NMX::Subscription VObjectEvaluationEngine::OnChange(std::function<void()> handler)
{
  return m_worker->OnChange(std::move(handler));
}

}
