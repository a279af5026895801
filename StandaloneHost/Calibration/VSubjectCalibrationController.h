#pragma once

#include "HostInterface/ISubjectCalibrationController.h"
#include "HostInterface/NMX/IAsioPostalService.h"
#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "StandaloneHost/Calibration/VCalibrationNotifications.h"
#include "StoreInterface/IStore.h"

#include <boost/asio/steady_timer.hpp>

#include <array>
#include <chrono>
#include <memory>
#include <mutex>

namespace Calibration
{

/// How long the parts of a calibration take.
struct CalibrationTimes
{
  std::chrono::milliseconds tPose{60000};       ///< until the T-pose must have been accepted
  std::chrono::milliseconds calibrating{10000}; ///< from there until the calibration ends by itself
};

/// Plays the calibration of subjects: there is nobody to be measured, but phases, sessions, time-outs and results are
/// real, and so is what comes of it in the store. The subject that is being calibrated says so
/// ("Parameters/Calibration" is 1), and is calibrated afterwards (2); after a cancellation or a failure it is what it
/// was before.
///
/// A fresh start wants a new subject, a recalibration one that exists; both want it to be a general subject. [any]
class VSubjectCalibrationController final : public ISubjectCalibrationController,
                                            public std::enable_shared_from_this<VSubjectCalibrationController>
{
public:
  VSubjectCalibrationController(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IAsioPostalService> postal,
                                std::shared_ptr<VCalibrationNotifications> notifications, CalibrationTimes times);

  /// Ends what an earlier program left running, takes the subject of the name that was given last, if there is one, for
  /// its target, and watches from now on what its possibilities depend on: `postal` is where changes of the store are
  /// told. To be called once. [host]
  void Open(const std::weak_ptr<NMX::IPostalService>& postal);

  /// Ends its timer, so that it edits the store no more. What runs is ended at the next start. [host]
  void Stop();

  NMX::IResult SetTargetSubject(NMX::TSubjectStoreId subject) override;
  NMX::IResult SetTargetSubjects(const std::set<NMX::TSubjectStoreId>& subjects) override;
  bool CanPerform(ECalibrationAction action, std::string& reason) const override;
  NMX::IResult Perform(ECalibrationAction action, NMX::TCalibrationSessionId& session) override;
  [[nodiscard]] std::uint32_t Phase() const override;
  [[nodiscard]] NMX::TCalibrationSessionId Session() const override;
  [[nodiscard]] NMX::IResult LastResult() const override;
  void SetFreshCalibration(bool fresh) override;

private:
  enum EPhase : std::uint32_t
  {
    Idle,
    FindingTPose,
    FirstPass,
    SecondPass
  };

  /// What a run has begun with.
  struct Run
  {
    NMX::TCalibrationSessionId session;
    NMX::TSubjectStoreId subject;
    std::int32_t before = 0; ///< the subject's calibration
  };

  struct State
  {
    EPhase phase = Idle;
    Run run; ///< the latest
    NMX::IResult lastResult = NMX::EResult::NotSet;
    NMX::TSubjectStoreId target;
  };

  [[nodiscard]] State Current() const;
  [[nodiscard]] std::string Obstacle(ECalibrationAction action) const;
  [[nodiscard]] std::string ObstacleToStart(ECalibrationAction action, NMX::TSubjectStoreId target) const;
  NMX::IResult Start(NMX::TCalibrationSessionId& session);
  NMX::IResult End(NMX::IResult result);
  void Enter(EPhase phase, std::chrono::milliseconds time);
  void OnTime(const boost::asio::steady_timer* timer) noexcept;
  NMX::IResult Advance(const boost::asio::steady_timer* timer);
  void Tell();

  const std::shared_ptr<NMX::IStore> m_store;
  const std::shared_ptr<NMX::IAsioPostalService> m_postal;
  const std::shared_ptr<VCalibrationNotifications> m_notifications;
  const CalibrationTimes m_times;
  std::mutex m_stepMutex;          // one step at a time; taken before the store is opened
  mutable std::mutex m_stateMutex; // taken last, and never while the store is asked
  State m_state;                   // written under both
  std::unique_ptr<boost::asio::steady_timer> m_timer;
  bool m_stopped = false;
  std::array<NMX::Subscription, 2> m_subscriptions;
};

}
