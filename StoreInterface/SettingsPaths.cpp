#include "StoreInterface/SettingsPaths.h"

namespace NMX
{

const std::array<EntryPath, settingCount>& SettingsPaths()
{
  static const std::array<EntryPath, settingCount> paths{
      EntryPath("Application/Settings/SubjectStore"),
      EntryPath("Application/Settings/SubjectStore/AddMarkerToObjectAction"),
      EntryPath("Application/Settings/SubjectStore/CalibrateOnCreate"),
      EntryPath("Application/Settings/SubjectStore/CalibrationAction"),
      EntryPath("Application/Settings/SubjectStore/CancelCalibrationAction"),
      EntryPath("Application/Settings/SubjectStore/CancelledCalibrationGracePeriod"),
      EntryPath("Application/Settings/SubjectStore/CaptureCancelledCalibrations"),
      EntryPath("Application/Settings/SubjectStore/CaptureProcessed"),
      EntryPath("Application/Settings/SubjectStore/CaptureVideo"),
      EntryPath("Application/Settings/SubjectStore/CreateCFCAction"),
      EntryPath("Application/Settings/SubjectStore/CreateCFCName"),
      EntryPath("Application/Settings/SubjectStore/CreateCFCRetarget"),
      EntryPath("Application/Settings/SubjectStore/CreateCFCTemplate"),
      EntryPath("Application/Settings/SubjectStore/CreateLabellingClusterAction"),
      EntryPath("Application/Settings/SubjectStore/CreateLabellingClusterName"),
      EntryPath("Application/Settings/SubjectStore/CreateObjectAction"),
      EntryPath("Application/Settings/SubjectStore/CreateObjectName"),
      EntryPath("Application/Settings/SubjectStore/CreateSmartObjectAction"),
      EntryPath("Application/Settings/SubjectStore/CreateSmartObjectName"),
      EntryPath("Application/Settings/SubjectStore/CreateSmartObjectTemplate"),
      EntryPath("Application/Settings/SubjectStore/CreateSubjectAction"),
      EntryPath("Application/Settings/SubjectStore/CreateSubjectName"),
      EntryPath("Application/Settings/SubjectStore/CreateSubjectSkin"),
      EntryPath("Application/Settings/SubjectStore/CreateSubjectTemplate"),
      EntryPath("Application/Settings/SubjectStore/EnableCapture"),
      EntryPath("Application/Settings/SubjectStore/LabellingClusterSelection"),
      EntryPath("Application/Settings/SubjectStore/LinkCameraAction"),
      EntryPath("Application/Settings/SubjectStore/NameRegex"),
      EntryPath("Application/Settings/SubjectStore/RemoveMarkerFromObjectAction"),
      EntryPath("Application/Settings/SubjectStore/UnlinkCameraAction")};
  return paths;
}

}
