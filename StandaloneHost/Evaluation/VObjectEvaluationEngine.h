#pragma once

#include "HostInterface/NMX/VShared.h"
#include "HostInterface/RunaCorePluginInterface/IObjectEvaluationSettings.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/Value.h"

#include <memory>

namespace Evaluation
{

class EvaluationWorker;

/// The standalone host's object evaluation. It runs in a thread of its own while it is switched on; its settings are in
/// the store. [any]
///
/// A warning is raised as soon as its cause is known, and cleared once nothing is due that could be another cause.
class VObjectEvaluationEngine : public RunaCorePluginInterface::IObjectEvaluationSettings, public NMX::VShared
{
public:
  explicit VObjectEvaluationEngine(std::shared_ptr<NMX::IStore> store);
  ~VObjectEvaluationEngine() override;

  /// Ends the thread, whatever it is at. Nothing is evaluated any more. [host]
  void Stop();

  NMX::IResult Enabled(bool& enabled) const override;
  NMX::IResult SetEnabled(bool enabled) override;
  NMX::IResult MaximumEvaluationStepCount(std::uint64_t& count) const override;
  NMX::IResult SetMaximumEvaluationStepCount(std::uint64_t count) override;
  NMX::IResult WarningThreshold(double& threshold) const override;
  NMX::IResult SetWarningThreshold(double threshold) override;
  NMX::IResult Progress(std::uint64_t& done, std::uint64_t& required) const override;
  NMX::IResult HighestStepCountReached(std::uint64_t& count) const override;
  NMX::IResult MatchDistance(const NMX::IStoreReader& access, NMX::TSubjectStoreId first, NMX::TSubjectStoreId second,
                             bool& matches, double& distance) const override;
  [[nodiscard]] NMX::Subscription OnChange(std::function<void()> handler) override;

private:
  [[nodiscard]] bool IsEnabled() const;
  NMX::IResult Set(NMX::EntryPath setting, NMX::Value value);

  const std::shared_ptr<NMX::IStore> m_store;
  const std::unique_ptr<EvaluationWorker> m_worker;
};

}
