#pragma once

#include "StoreInterface/EntryPath.h"

#include <array>
#include <cstddef>

namespace NMX
{

/// The settings of the subject panel and of subject calibration: application entries, numbered in this order.
enum class ESetting : std::size_t
{
  Root, ///< what they all lie beneath; has no value
  AddMarkerToObjectAction,
  CalibrateOnCreate,
  CalibrationAction,
  CancelCalibrationAction,
  CancelledCalibrationGracePeriod,
  CaptureCancelledCalibrations,
  CaptureProcessed,
  CaptureVideo,
  CreateCFCAction,
  CreateCFCName,
  CreateCFCRetarget,
  CreateCFCTemplate,
  CreateLabellingClusterAction,
  CreateLabellingClusterName,
  CreateObjectAction,
  CreateObjectName,
  CreateSmartObjectAction,
  CreateSmartObjectName,
  CreateSmartObjectTemplate,
  CreateSubjectAction,
  CreateSubjectName,
  CreateSubjectSkin,
  CreateSubjectTemplate,
  EnableCapture,
  LabellingClusterSelection,
  LinkCameraAction,
  NameRegex,
  RemoveMarkerFromObjectAction,
  UnlinkCameraAction
};

inline constexpr std::size_t settingCount = 30;

/// The paths of the settings, in the order of ESetting.
[[nodiscard]] const std::array<EntryPath, settingCount>& SettingsPaths();

[[nodiscard]] inline EntryPath PathOf(ESetting setting)
{
  return SettingsPaths()[static_cast<std::size_t>(setting)];
}

}
