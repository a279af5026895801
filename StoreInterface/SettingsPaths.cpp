#include "StoreInterface/SettingsPaths.h"

namespace NMX
{

const std::array<EntryPath, settingCount>& SettingsPaths()
{
  static const std::array<EntryPath, settingCount> paths{
      EntryPath::Constant("Application/Settings/SubjectStore"),
      EntryPath::Constant("Application/Settings/SubjectStore/AddMarkerToObjectAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/CalibrateOnCreate"),
      EntryPath::Constant("Application/Settings/SubjectStore/CalibrationAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/CancelCalibrationAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/CancelledCalibrationGracePeriod"),
      EntryPath::Constant("Application/Settings/SubjectStore/CaptureCancelledCalibrations"),
      EntryPath::Constant("Application/Settings/SubjectStore/CaptureProcessed"),
      EntryPath::Constant("Application/Settings/SubjectStore/CaptureVideo"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateCFCAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateCFCName"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateCFCRetarget"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateCFCTemplate"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateLabellingClusterAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateLabellingClusterName"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateObjectAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateObjectName"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateSmartObjectAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateSmartObjectName"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateSmartObjectTemplate"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateSubjectAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateSubjectName"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateSubjectSkin"),
      EntryPath::Constant("Application/Settings/SubjectStore/CreateSubjectTemplate"),
      EntryPath::Constant("Application/Settings/SubjectStore/EnableCapture"),
      EntryPath::Constant("Application/Settings/SubjectStore/LabellingClusterSelection"),
      EntryPath::Constant("Application/Settings/SubjectStore/LinkCameraAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/NameRegex"),
      EntryPath::Constant("Application/Settings/SubjectStore/RemoveMarkerFromObjectAction"),
      EntryPath::Constant("Application/Settings/SubjectStore/UnlinkCameraAction")};
  return paths;
}

}
