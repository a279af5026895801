#include "RunaCorePluginSubjectStore/Catalogue/SubjectCalibrationCatalogue.h"

#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/SubjectCalibrationStates.h"

namespace Catalogue
{

using NMX::ISubjectCalibrationServices;
using TerminalServer2::Callback;
using TerminalServer2::ELevel;
using TerminalServer2::Function;

namespace
{

constexpr const TerminalServer2::TypeRecord* types[] = {&NMX::subjectCalibrationStates};

constexpr TerminalServer2::FunctionRow<ISubjectCalibrationServices> functions[] = {
    Function<&ISubjectCalibrationServices::CanStartSubjectCalibration>(
        "SubjectCalibrationServices.CanStartSubjectCalibration", "Is the system able to initiate subject calibration?",
        {{"Reason", "The reason why subject calibration cannot be initiated."}},
        "True - If you can start subject calibration.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::CanStartSubjectRecalibration>(
        "SubjectCalibrationServices.CanStartSubjectRecalibration",
        "Is the system able to initiate subject re-calibration?",
        {{"Reason", "The reason why subject re-calibration cannot be initiated."}},
        "True - If you can start subject re-calibration.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::CanAcceptTPose>(
        "SubjectCalibrationServices.CanAcceptTPose", "Can the system accept the current state as a T-Pose?",
        {{"Reason", "The reason why the T-Pose cannot be selected."}},
        "True - If you can accept the current state as a T-Pose.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::CanStopSubjectCalibration>(
        "SubjectCalibrationServices.CanStopSubjectCalibration", "Can the system stop (complete) subject calibration?",
        {{"Reason", "The reason why subject calibration cannot be completed."}},
        "True - If you can stop subject calibration.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::CanCancelSubjectCalibration>(
        "SubjectCalibrationServices.CanCancelSubjectCalibration", "Can the system cancel subject calibration?",
        {{"Reason", "The reason why subject calibration cannot be canceled."}},
        "True - If you can cancel subject calibration.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::StartSubjectCalibration>(
        "SubjectCalibrationServices.StartSubjectCalibration", "Initiates subject calibration.",
        {{"SubjectCalibrationSession",
          "Provides the session id for the calibration.  This is provided to to Cancel and Stop to ensure the "
          "correct subject calibration is being terminated."},
         {"CaptureName",
          "A capture name to use for the subject calibration files.  Leave blank to use the default.  If the name "
          "already exists in the capture directory it will be overwritten."}},
        "Ok - On success.\n"
        "InvalidArgument - If the capture name has invalid characters.\n"
        "NotAvailable - If calibration is currently running.",
        ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::StartSubjectRecalibration>(
        "SubjectCalibrationServices.StartSubjectRecalibration",
        "Initiates subject re-calibration. The subject to update should be named using 'set subject name'.",
        {{"SubjectCalibrationSession",
          "Provides the session id for the calibration.  This is provided to to Cancel and Stop to ensure the "
          "correct subject calibration is being terminated."},
         {"CaptureName",
          "A capture name to use for the subject calibration files.  Leave blank to use the default.  If the name "
          "already exists in the capture directory it will be overwritten."}},
        "Ok - On success.\n"
        "InvalidArgument - If the capture name has invalid characters.\n"
        "NotAvailable - If calibration is currently running.",
        ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::AcceptTPose>(
        "SubjectCalibrationServices.AcceptTPose", "During calibration, mark the subject as being in the T-pose.",
        {{"SubjectCalibrationSession",
          "The session id for the calibration.  This will have been provided by StartSubjectCalibration or "
          "StartSubjectRecalibration."}},
        "Ok - On success.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::CancelSubjectCalibration>(
        "SubjectCalibrationServices.CancelSubjectCalibration",
        "Cancel the currently running subject calibration or re-calibration.",
        {{"SubjectCalibrationSession",
          "The session id for the calibration.  This will have been provided by StartSubjectCalibration or "
          "StartSubjectRecalibration."}},
        "Ok - On success.\n"
        "NotAvailable - If calibration is not currently running.",
        ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::StopSubjectCalibration>(
        "SubjectCalibrationServices.StopSubjectCalibration",
        "Stop the currently running subject calibration or re-calibration.",
        {{"SubjectCalibrationSession",
          "The session id for the calibration.  This will have been provided by StartSubjectCalibration or "
          "StartSubjectRecalibration."}},
        "Ok - On success.\n"
        "NotAvailable - If calibration is not currently running.",
        ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::LatestSubjectCalibrationState>(
        "SubjectCalibrationServices.LatestSubjectCalibrationState",
        "Get the current state of calibration or re-calibration.",
        {{"SessionId", "The currently executing session id."}, {"State", "The current state of calibration."}},
        "Ok - On success.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::NewSubjectName>(
        "SubjectCalibrationServices.NewSubjectName",
        "The name for the subject to be created by the next subject calibration, or updated by recalibration.",
        {{"SubjectName", "The subject name."}},
        "Ok - On success.\n"
        "InvalidArgument - If the name contains .\n",
        ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::SetNewSubjectName>(
        "SubjectCalibrationServices.SetNewSubjectName",
        "Set the name for the subject to be created by the next subject calibration, or updated by recalibration.",
        {{"SubjectName", "Subject name to set."}}, "Ok - On success.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::SubjectLabellingTemplates>(
        "SubjectCalibrationServices.SubjectLabellingTemplates",
        "The set of templates available for generating the labeling skeleton.",
        {{"LabellingTemplates", "The set of labeling templates."}}, "Ok - On success.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::SubjectLabellingTemplate>(
        "SubjectCalibrationServices.SubjectLabellingTemplate", "The template for generating the labeling skeleton.",
        {{"LabellingTemplate", "The labeling template to use for the next subject calibration."},
         {"LabellingTemplatePath", "The full path to the template."}},
        "Ok - On success.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::SetSubjectLabellingTemplate>(
        "SubjectCalibrationServices.SetSubjectLabellingTemplate",
        "Set the template for generating the labeling skeleton.  Should be from the set provided by "
        "SubjectLabellingTemplates.",
        {{"LabellingTemplate", "The labeling template to use for the next subject calibration."}},
        "Ok - On success.\n"
        "NotFound - The provided template name is not available.",
        ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::SubjectSkins>(
        "SubjectCalibrationServices.SubjectSkins", "The set of skins available for generating the solving skeleton.",
        {{"Skins", "The set of available skins."}}, "Ok - On success.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::SubjectSkin>(
        "SubjectCalibrationServices.SubjectSkin", "The skin to use for subject calibration.",
        {{"Skin", "The skin name to use for the next subject calibration."},
         {"SkinPath", "The full path to the skin."}},
        "Ok - On success.", ELevel::SubjectCalibration),
    Function<&ISubjectCalibrationServices::SetSubjectSkin>(
        "SubjectCalibrationServices.SetSubjectSkin",
        "Set the skin for generating the solving skeleton.  Should be from the set provided by SubjectSkins.",
        {{"Skin", "The skin use for the next subject calibration."}},
        "Ok - On success.\n"
        "NotFound - The provided skin name is not available.",
        ELevel::SubjectCalibration)};

constexpr TerminalServer2::CallbackRow<ISubjectCalibrationServices> callbacks[] = {
    Callback<&ISubjectCalibrationServices::CanStartSubjectCalibrationChangedCallback>(
        "SubjectCalibrationServices.CanStartSubjectCalibrationChangedCallback",
        "Callback issued whenever the systems ability to start subject calibration changed.",
        {{"Able", "Can the system start subject calibration?"}}, ELevel::SubjectCalibration),
    Callback<&ISubjectCalibrationServices::CanStartSubjectRecalibrationChangedCallback>(
        "SubjectCalibrationServices.CanStartSubjectRecalibrationChangedCallback",
        "Callback issued whenever the systems ability to start subject re-calibration changed.",
        {{"Able", "Can the system start subject re-calibration?"}}, ELevel::SubjectCalibration),
    Callback<&ISubjectCalibrationServices::CanAcceptTPoseChangedCallback>(
        "SubjectCalibrationServices.CanAcceptTPoseChangedCallback",
        "Callback issued whenever the systems ability to accept a T-Pose changed.",
        {{"Able", "Can the system accept a T-Pose?"}}, ELevel::SubjectCalibration),
    Callback<&ISubjectCalibrationServices::CanStopSubjectCalibrationChangedCallback>(
        "SubjectCalibrationServices.CanStopSubjectCalibrationChangedCallback",
        "Callback issued whenever the systems ability to stop subject calibration or re-calibration changed.",
        {{"Able", "Can the system stop subject calibration?"}}, ELevel::SubjectCalibration),
    Callback<&ISubjectCalibrationServices::CanStopSubjectCalibrationChangedCallback>(
        "SubjectCalibrationServices.CanEndSubjectCalibrationChangedCallback",
        "@deprecated(Tessera) Deprecated alias for CanStopSubjectCalibrationChangedCallback.",
        {{"Able", "Can the system stop subject calibration?"}}, ELevel::SubjectCalibration),
    Callback<&ISubjectCalibrationServices::CanCancelSubjectCalibrationChangedCallback>(
        "SubjectCalibrationServices.CanCancelSubjectCalibrationChangedCallback",
        "Callback issued whenever the systems ability to cancel subject calibration or re-calibration changed.",
        {{"Able", "Can the system cancel subject calibration?"}}, ELevel::SubjectCalibration),
    Callback<&ISubjectCalibrationServices::LatestSubjectCalibrationStateChangedCallback>(
        "SubjectCalibrationServices.LatestSubjectCalibrationStateChangedCallback",
        "Callback issued whenever the calibration state changes.",
        {{"SessionId", "The currently executing session id."}, {"State", "The current state of calibration."}},
        ELevel::SubjectCalibration),
    Callback<&ISubjectCalibrationServices::SubjectCalibrationSettingsChangedCallback>(
        "SubjectCalibrationServices.SubjectCalibrationSettingsChangedCallback",
        "Callback issued whenever any of the calibration settings changes.", ELevel::SubjectCalibration)};

}

const TerminalServer2::GroupTable<ISubjectCalibrationServices>& SubjectCalibrationGroup()
{
  static constexpr TerminalServer2::GroupTable<ISubjectCalibrationServices> table{
      {"SubjectCalibrationServices", "Functions for controlling and monitoring subject calibration.", {}},
      types,
      ELevel::SubjectCalibration,
      functions,
      callbacks};
  return table;
}

}
