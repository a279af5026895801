#pragma once

#include "HostInterface/RunaCorePluginInterface/ICalibrationProvider.h"
#include "StandaloneHost/Calibration/VSubjectCalibrationController.h"
#include "StandaloneHost/Calibration/VSubjectCreator.h"

namespace Calibration
{

/// The standalone host's subject calibration. [host]
class VCalibrationProvider final : public RunaCorePluginInterface::ICalibrationProvider
{
public:
  VCalibrationProvider(const std::shared_ptr<NMX::IStore>& store,
                       const std::shared_ptr<NMX::IAsioPostalService>& postal, CalibrationTimes times)
      : m_controller(std::make_shared<VSubjectCalibrationController>(store, postal, m_notifications, times))
  {
  }

  /// As VSubjectCalibrationController has them.
  void Open(const std::weak_ptr<NMX::IPostalService>& postal) { m_controller->Open(postal); }
  void Stop() { m_controller->Stop(); }

  void Controller(std::shared_ptr<ISubjectCalibrationController>& controller) const override
  {
    controller = m_controller;
  }
  void SubjectCreator(std::shared_ptr<ISubjectCreator>& creator) const override { creator = m_creator; }
  void Notifications(std::shared_ptr<ICalibrationNotifications>& notifications) const override
  {
    notifications = m_notifications;
  }

private:
  const std::shared_ptr<VCalibrationNotifications> m_notifications = std::make_shared<VCalibrationNotifications>();
  const std::shared_ptr<VSubjectCalibrationController> m_controller;
  const std::shared_ptr<VSubjectCreator> m_creator = std::make_shared<VSubjectCreator>();
};

}
