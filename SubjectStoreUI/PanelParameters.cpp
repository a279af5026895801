#include "SubjectStoreUI/PanelParameters.h"

#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/SettingsPaths.h"

namespace SubjectStoreUI
{

using NMX::ESetting;
namespace Paths = NMX::Paths;

std::vector<StoreUI::Parameter> SetupParameters()
{
  const auto setting = [](ESetting which, const char* label)
  {
    const NMX::EntryPath path = NMX::PathOf(which);
    const std::size_t prefix = NMX::PathOf(ESetting::Root).Text().size() + 1;
    const std::string key(path.Text().substr(prefix));
    return StoreUI::Parameter{path, QString::fromStdString(key), label};
  };
  return {
      setting(ESetting::CreateSubjectName, "Name"),
      setting(ESetting::CreateSubjectTemplate, "Labelling template"),
      setting(ESetting::CreateSubjectSkin, "Skin"),
      setting(ESetting::CreateSubjectAction, "Create subject"),
      setting(ESetting::CalibrateOnCreate, "Calibrate when created"),
      setting(ESetting::CreateCFCName, "Name"),
      setting(ESetting::CreateCFCTemplate, "Template"),
      setting(ESetting::CreateCFCRetarget, "Retarget"),
      setting(ESetting::CreateCFCAction, "Create character"),
      setting(ESetting::CreateSmartObjectName, "Name"),
      setting(ESetting::CreateSmartObjectTemplate, "Template"),
      setting(ESetting::CreateSmartObjectAction, "Create smart object"),
      setting(ESetting::CreateObjectName, "Name"),
      setting(ESetting::CreateObjectAction, "Create object"),
      setting(ESetting::CreateLabellingClusterName, "Name"),
      setting(ESetting::CreateLabellingClusterAction, "Create labelling cluster"),
      setting(ESetting::CalibrationAction, "Calibrate"),
      setting(ESetting::CancelCalibrationAction, "Cancel calibration"),
      setting(ESetting::CancelledCalibrationGracePeriod, "Keep cancelled calibrations (s)"),
      setting(ESetting::EnableCapture, "Capture calibrations"),
      setting(ESetting::CaptureCancelledCalibrations, "Capture cancelled calibrations"),
      setting(ESetting::CaptureProcessed, "Capture processed data"),
      setting(ESetting::CaptureVideo, "Capture video"),
      setting(ESetting::AddMarkerToObjectAction, "Add marker to object"),
      setting(ESetting::RemoveMarkerFromObjectAction, "Remove marker from object"),
      setting(ESetting::LinkCameraAction, "Link camera"),
      setting(ESetting::UnlinkCameraAction, "Unlink camera"),
  };
}

std::vector<StoreUI::Parameter> SubjectParameters()
{
  const auto entry = [](NMX::EntryPath path, const char* label, bool editable = true)
  {
    const std::string key(path.Text());
    return StoreUI::Parameter{path, QString::fromStdString(key), label, editable};
  };
  return {
      entry(Paths::Name(), "Name"),
      entry(Paths::Enabled(), "Enabled"),
      entry(Paths::ColourRGBA(), "Colour"),
      entry(Paths::PresetName(), "Preset", false),
      entry(Paths::ProximityGroupName(), "Proximity group"),
      entry(Paths::TemplateGroupName(), "Template group"),
      entry(Paths::AutoAssignEnabled(), "Assign automatically"),
      entry(Paths::AutoAssignedName(), "Assigned as", false),
      entry(Paths::EntranceThreshold(), "Markers to recognise it by"),
      entry(Paths::RootSegmentName(), "Root segment"),
      entry(Paths::SkinName(), "Skin"),
      entry(Paths::MarkersOnWhileCharging(), "Markers on while charging"),
      entry(Paths::TrackWithObjectTracker(), "Track with object tracker"),
      entry(Paths::LinkedCameraURN(), "Linked camera", false),
      entry(Paths::RoleLabelling(), "Labelling"),
      entry(Paths::RoleSolving(), "Solving"),
      entry(Paths::RoleRetargeting(), "Retargeting"),
      entry(Paths::Retarget(), "Retarget file"),
      entry(Paths::ModelOutputCGM2(), "Model output CGM2"),
      entry(Paths::ModelOutputPluginKinex(), "Model output PluginKinex"),
      entry(Paths::FilePath(), "File", false),
  };
}

}
