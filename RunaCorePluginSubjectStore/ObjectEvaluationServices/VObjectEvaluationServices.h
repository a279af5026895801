#pragma once

#include "HostInterface/NMX/VShared.h"
#include "HostInterface/NotificationSystem/VMultiCallbackPostal.h"
#include "HostInterface/RunaCorePluginInterface/IObjectEvaluationSettings.h"
#include "RunaCorePluginSubjectStore/ObjectEvaluationServices/IObjectEvaluationServices.h"
#include "StoreInterface/IStore.h"

namespace ObjectEvaluationServices
{

/// Answers the remote group "ObjectEvaluationServices" from the host's object evaluation. Keeps no copy of any setting.
/// [strand]
class VObjectEvaluationServices : public NMX::IObjectEvaluationServices, public NMX::VShared
{
public:
  using Engine = RunaCorePluginInterface::IObjectEvaluationSettings;

  /// A service that raises its callback whenever the engine reports a change. The engine may be missing.
  [[nodiscard]] static std::shared_ptr<VObjectEvaluationServices> Make(std::shared_ptr<NMX::IStore> store,
                                                                       std::shared_ptr<Engine> engine);

  NMX::IResult Enabled(bool& enabled) const override;
  NMX::IResult SetEnabled(bool enabled) override;
  NMX::IResult MaximumEvaluationStepCount(std::uint64_t& maximumStepCount) const override;
  NMX::IResult SetMaximumEvaluationStepCount(std::uint64_t maximumStepCount) override;
  NMX::IResult WarningThreshold(double& threshold) const override;
  NMX::IResult SetWarningThreshold(double threshold) override;
  NMX::IResult Progress(std::uint64_t& done, std::uint64_t& required) const override;
  NMX::IResult HighestStepCountReached(std::uint64_t& highestStepCountReached) const override;
  NMX::IResult MatchDistance(const std::string& firstObjectName, const std::string& secondObjectName, bool& matches,
                             double& matchDistance) const override;
  std::shared_ptr<ChangedCallback> EvaluationChangedCallback() override;

protected:
  VObjectEvaluationServices(std::shared_ptr<NMX::IStore> store, std::shared_ptr<Engine> engine);

private:
  const std::shared_ptr<NMX::IStore> m_store;
  const std::shared_ptr<Engine> m_engine;
  const std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void()>> m_changed;
  NMX::Subscription m_engineChanges;
};

}
