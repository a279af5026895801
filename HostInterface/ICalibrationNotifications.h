#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"

#include <memory>

/// Tells of subject calibration. [any]
class ICalibrationNotifications
{
public:
  using Callback = NMX::IMultiCallbackPostal<void()>;

  ICalibrationNotifications() = default;
  ICalibrationNotifications(const ICalibrationNotifications&) = delete;
  ICalibrationNotifications& operator=(const ICalibrationNotifications&) = delete;
  virtual ~ICalibrationNotifications() = default;

  /// Raised when the phase or the last result may be another.
  [[nodiscard]] virtual std::shared_ptr<Callback> StateChanged() = 0;

  /// Raised when what is possible, a fresh start included, may be another.
  [[nodiscard]] virtual std::shared_ptr<Callback> PossibilitiesChanged() = 0;
};
