#pragma once

#include "HostInterface/ICalibrationNotifications.h"
#include "HostInterface/NMX/VShared.h"
#include "HostInterface/NotificationSystem/VMultiCallbackPostal.h"

namespace Calibration
{

/// What the host tells of subject calibration. [any]
class VCalibrationNotifications final : public ICalibrationNotifications
{
public:
  [[nodiscard]] std::shared_ptr<Callback> StateChanged() override { return m_stateChanged; }
  [[nodiscard]] std::shared_ptr<Callback> PossibilitiesChanged() override { return m_possibilitiesChanged; }

  void TellState() { m_stateChanged->Fire(); }
  void TellPossibilities() { m_possibilitiesChanged->Fire(); }

private:
  using MultiCallback = NotificationSystem::VMultiCallbackPostal<void()>;
  const std::shared_ptr<MultiCallback> m_stateChanged = NMX::MakeShared<MultiCallback>();
  const std::shared_ptr<MultiCallback> m_possibilitiesChanged = NMX::MakeShared<MultiCallback>();
};

}
