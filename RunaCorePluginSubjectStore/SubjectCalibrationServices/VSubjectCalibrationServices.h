#pragma once

#include "HostInterface/ICalibrationNotifications.h"
#include "HostInterface/ISubjectCalibrationController.h"
#include "HostInterface/ISubjectCreator.h"
#include "HostInterface/NMX/IPostalService.h"
#include "HostInterface/NMX/VShared.h"
#include "HostInterface/NotificationSystem/VMultiCallbackPostal.h"
#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/ISubjectCalibrationServices.h"
#include "StoreInterface/IStore.h"

#include <array>
#include <cstddef>

namespace SubjectCalibrationServices
{

/// The remote group "SubjectCalibrationServices": drives the host's calibration controller, and keeps its settings in
/// the store. Calls and the host's notifications run on the same strand, one at a time, so that nothing is locked.
/// [strand]
class VSubjectCalibrationServices : public NMX::ISubjectCalibrationServices, public NMX::VShared
{
public:
  /// A service that hears of the host's notifications on `strand`, until either of them is gone. [host]
  static std::shared_ptr<VSubjectCalibrationServices> Make(std::shared_ptr<NMX::IStore> store,
                                                           std::shared_ptr<ISubjectCalibrationController> controller,
                                                           std::shared_ptr<ISubjectCreator> creator,
                                                           ICalibrationNotifications& notifications,
                                                           const std::weak_ptr<NMX::IPostalService>& strand);

  /// Use Make, without which it hears of nothing.
  VSubjectCalibrationServices(std::shared_ptr<NMX::IStore> store,
                              std::shared_ptr<ISubjectCalibrationController> controller,
                              std::shared_ptr<ISubjectCreator> creator);

  bool CanStartSubjectCalibration(std::string& reason) const override;
  bool CanStartSubjectRecalibration(std::string& reason) const override;
  bool CanAcceptTPose(std::string& reason) const override;
  bool CanStopSubjectCalibration(std::string& reason) const override;
  bool CanCancelSubjectCalibration(std::string& reason) const override;
  std::shared_ptr<CanChangedCallback> CanStartSubjectCalibrationChangedCallback() override;
  std::shared_ptr<CanChangedCallback> CanStartSubjectRecalibrationChangedCallback() override;
  std::shared_ptr<CanChangedCallback> CanAcceptTPoseChangedCallback() override;
  std::shared_ptr<CanChangedCallback> CanStopSubjectCalibrationChangedCallback() override;
  std::shared_ptr<CanChangedCallback> CanCancelSubjectCalibrationChangedCallback() override;
  NMX::IResult StartSubjectCalibration(NMX::TCalibrationSessionId& subjectCalibrationSession,
                                       const std::string& captureName) override;
  NMX::IResult StartSubjectRecalibration(NMX::TCalibrationSessionId& subjectCalibrationSession,
                                         const std::string& captureName) override;
  NMX::IResult AcceptTPose(NMX::TCalibrationSessionId subjectCalibrationSession) override;
  NMX::IResult CancelSubjectCalibration(NMX::TCalibrationSessionId subjectCalibrationSession) override;
  NMX::IResult StopSubjectCalibration(NMX::TCalibrationSessionId subjectCalibrationSession) override;
  NMX::IResult LatestSubjectCalibrationState(NMX::TCalibrationSessionId& sessionId,
                                             ESubjectCalibrationState& state) const override;
  std::shared_ptr<StateChangedCallback> LatestSubjectCalibrationStateChangedCallback() override;
  NMX::IResult SetNewSubjectName(const std::string& subjectName) override;
  NMX::IResult NewSubjectName(std::string& subjectName) const override;
  NMX::IResult SubjectLabellingTemplates(std::vector<std::string>& labellingTemplates) const override;
  NMX::IResult SetSubjectLabellingTemplate(const std::string& labellingTemplate) override;
  NMX::IResult SubjectLabellingTemplate(std::string& labellingTemplate,
                                        std::string& labellingTemplatePath) const override;
  NMX::IResult SubjectSkins(std::vector<std::string>& skins) const override;
  NMX::IResult SetSubjectSkin(const std::string& skin) override;
  NMX::IResult SubjectSkin(std::string& skin, std::string& skinPath) const override;
  std::shared_ptr<SettingsChangedCallback> SubjectCalibrationSettingsChangedCallback() override;

private:
  template <class... Arguments>
  using MultiCallback = std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void(Arguments...)>>;

  /// What can be possible or not, in the order in which changes are told.
  enum ECan : std::size_t
  {
    StartCalibration,
    StartRecalibration,
    AcceptPose,
    Stop,
    Cancel,
    CanCount
  };

  [[nodiscard]] ESubjectCalibrationState State() const;
  void TellState();
  void RefreshPossibilities();
  NMX::IResult CreateSubject(NMX::TSubjectStoreId& subject);
  NMX::IResult SetTarget(NMX::TSubjectStoreId subject);
  NMX::IResult PerformIfPossible(ECalibrationAction action, NMX::TCalibrationSessionId session);
  NMX::IResult Start(ECalibrationAction action, NMX::TCalibrationSessionId& session);

  const std::shared_ptr<NMX::IStore> m_store;
  const std::shared_ptr<ISubjectCalibrationController> m_controller;
  const std::shared_ptr<ISubjectCreator> m_creator;
  NMX::TCalibrationSessionId m_session; // of the run that was started last
  std::array<bool, CanCount> m_can{};
  const MultiCallback<NMX::TCalibrationSessionId, ESubjectCalibrationState> m_stateChanged;
  const MultiCallback<> m_settingsChanged;
  const std::array<MultiCallback<bool>, CanCount> m_canChanged;
  std::array<NMX::Subscription, 3> m_subscriptions;
};

}
