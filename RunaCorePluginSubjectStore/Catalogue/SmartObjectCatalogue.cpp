#include "RunaCorePluginSubjectStore/Catalogue/SmartObjectCatalogue.h"

#include "RunaCorePluginSubjectStore/SmartObjectServices/SmartObjectWarnings.h"

namespace Catalogue
{

using NMX::ISmartObjectServices;
using TerminalServer2::Callback;
using TerminalServer2::ELevel;
using TerminalServer2::Function;

namespace
{

constexpr const TerminalServer2::TypeRecord* types[] = {&NMX::smartObjectWarnings};

constexpr TerminalServer2::FunctionRow<ISmartObjectServices> functions[] = {
    Function<&ISmartObjectServices::SmartObjectList>(
        "SmartObjectServices.SmartObjectList", "The list of loaded smart object names.",
        {{"Names", "List of smart object names."}}, "Ok - On success."),
    Function<&ISmartObjectServices::Add>(
        "SmartObjectServices.Add",
        "Add a new smart object using the Corvex template. A unique pattern will be assigned automatically if "
        "possible.",
        {{"Name", "Name for the newly created smart object."}},
        "Ok - On success.\n"
        "AlreadyPresent - If the name is already in use.\n"
        "InvalidName - If the name contains invalid characters or has leading/trailing spaces."),
    Function<&ISmartObjectServices::AddFromTemplate>(
        "SmartObjectServices.AddFromTemplate",
        "Add a new smart object using the specified template. A unique pattern will be assigned to each smart "
        "cluster automatically if possible.",
        {{"Name", "Name for the newly created smart object."},
         {"Template",
          "Absolute path to a smart object template file. This path must be accessible from the remote host."}},
        ""),
    Function<&ISmartObjectServices::Remove>(
        "SmartObjectServices.Remove", "Remove a smart object.", {{"Name", "Smart object name."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is not loaded."),
    Function<&ISmartObjectServices::RemoveAll>(
        "SmartObjectServices.RemoveAll", "Remove all smart objects.", "Ok - On success."),
    Function<&ISmartObjectServices::CompatibleDeviceTypes>(
        "SmartObjectServices.CompatibleDeviceTypes", "Get a list of device types compatible with smart objects.",
        {{"DeviceTypes", "Compatible device types."}}, "Ok - On success."),
    Function<&ISmartObjectServices::CreateSmartObjects>("SmartObjectServices.CreateSmartObjects", "", ""),
    Function<&ISmartObjectServices::AssignOptimalActiveMarkerPatterns>(
        "SmartObjectServices.AssignOptimalActiveMarkerPatterns",
        "Assign a distinct active marker pattern to each smart cluster in the loaded smart objects.\n"
        "If there isn't a pattern set that supports the required number of patterns, any excess smart clusters will "
        "be assigned pattern 0.",
        "Ok - On success.\n"
        "NotFound - If an unrecognized smart cluster type was found.\n"
        "NotSupported - If an unsupported combination of smart cluster types was found."),
    Function<&ISmartObjectServices::AutoPatternManagementEnabled>(
        "SmartObjectServices.AutoPatternManagementEnabled",
        "Get if smart object patterns are being managed automatically by the application.",
        {{"Enabled", "If automatic pattern management is enabled."}}, "Ok - On success."),
    Function<&ISmartObjectServices::SetAutoPatternManagementEnabled>(
        "SmartObjectServices.SetAutoPatternManagementEnabled",
        "Set if smart object patterns should be managed automatically by the application.",
        {{"Enabled", "If automatic pattern management should be enabled."}}, "Ok - On success."),
    Function<&ISmartObjectServices::Rename>(
        "SmartObjectServices.Rename", "Update the smart object name.",
        {{"OldName", "Name of the smart object to update."}, {"NewName", "New smart object name."}},
        "Ok - On success.\n"
        "AlreadyPresent - if the new name is already in use.\n"
        "InvalidName - if the new name contains invalid characters or has leading/trailing spaces.\n"
        "NotFound - If the smart object name supplied is invalid."),
    Function<&ISmartObjectServices::SmartClusterCount>(
        "SmartObjectServices.SmartClusterCount", "The number of smart clusters that make up this smart object.",
        {{"Name", "Name of the smart object."}, {"Count", "Number of smart clusters."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid."),
    Function<&ISmartObjectServices::SmartClusterLabel>(
        "SmartObjectServices.SmartClusterLabel", "The label used to identify a smart cluster on the smart object.",
        {{"Name", "Name of the smart object."},
         {"SmartClusterIndex", "Index of the smart cluster."},
         {"Label", "Label of the smart cluster."}},
        ""),
    Function<&ISmartObjectServices::SetSmartClusterLabel>(
        "SmartObjectServices.SetSmartClusterLabel",
        "Set the label used to identify a smart cluster on the smart object.",
        {{"Name", "Name of the smart object."},
         {"SmartClusterIndex", "Index of the smart cluster."},
         {"Label", "New label for the smart cluster."}},
        ""),
    Function<&ISmartObjectServices::SmartClusterActiveMarkerPattern>(
        "SmartObjectServices.SmartClusterActiveMarkerPattern",
        "The marker pattern to set on the smart cluster. This updates the markers on the linked device and the "
        "associated subject for tracking.",
        {{"Name", "Name of the smart object."},
         {"SmartClusterIndex", "Index of the smart cluster."},
         {"Pattern", "Marker pattern of the smart cluster."}},
        "Ok - On success.\n"
        "InvalidIndex - If the smart cluster index is greater than or equal to the smart cluster count.\n"
        "NotFound - If the smart object name supplied is invalid."),
    Function<&ISmartObjectServices::SetSmartClusterActiveMarkerPattern>(
        "SmartObjectServices.SetSmartClusterActiveMarkerPattern",
        "Update the marker pattern to set on the smart cluster.",
        {{"Name", "Name of the smart object."},
         {"SmartClusterIndex", "Index of the smart cluster."},
         {"Pattern", "New marker pattern for the smart cluster."}},
        "Ok - On success.\n"
        "InvalidIndex - If the smart cluster index is greater than or equal to the smart cluster count.\n"
        "NotFound - If the smart object name supplied is invalid."),
    Function<&ISmartObjectServices::SmartClusterDeviceURN>(
        "SmartObjectServices.SmartClusterDeviceURN", "The device linked to this smart cluster.",
        {{"Name", "Name of the smart object."},
         {"SmartClusterIndex", "Index of the smart cluster."},
         {"DeviceURN", "Device URN linked to this smart cluster."}},
        ""),
    Function<&ISmartObjectServices::SetSmartClusterDeviceURN>(
        "SmartObjectServices.SetSmartClusterDeviceURN",
        "Update the device linked with this smart cluster. To clear the link to a device set the URN to an empty "
        "string.",
        {{"Name", "Name of the smart object to update."},
         {"SmartClusterIndex", "Index of the smart cluster."},
         {"DeviceURN", "Device URN to link with this smart cluster."}},
        ""),
    Function<&ISmartObjectServices::Enabled>(
        "SmartObjectServices.Enabled", "Get the enabled value of a smart object.",
        {{"Name", "Name of the smart object."}, {"Enabled", "Enabled value."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid."),
    Function<&ISmartObjectServices::SetEnabled>(
        "SmartObjectServices.SetEnabled", "Enable or disable a smart object.",
        {{"Name", "Name of the smart object to update."}, {"Enabled", "Enabled value."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid."),
    Function<&ISmartObjectServices::SetAllEnabled>(
        "SmartObjectServices.SetAllEnabled", "Enable or disable all smart objects.", {{"Enabled", "Enabled value."}},
        "Ok - On success."),
    Function<&ISmartObjectServices::Color>(
        "SmartObjectServices.Color", "Get the color of a smart object (and the generated object).",
        {{"Name", "Name of the smart object."}, {"ColorHtml", "HTML hex color code (format '#AARRGGBB')."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid."),
    Function<&ISmartObjectServices::SetColor>(
        "SmartObjectServices.SetColor", "Set the color of a smart object (and the generated object).",
        {{"Name", "Name of the smart object to update."}, {"ColorHtml", "HTML hex color code (format '#AARRGGBB')."}},
        ""),
    Function<&ISmartObjectServices::ActiveMarkersOnWhileCharging>(
        "SmartObjectServices.ActiveMarkersOnWhileCharging",
        "Get the active markers on while charging value for linked devices.",
        {{"Name", "Name of the smart object."},
         {"OnWhileCharging", "True if active markers should be kept on while charging."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid."),
    Function<&ISmartObjectServices::SetActiveMarkersOnWhileCharging>(
        "SmartObjectServices.SetActiveMarkersOnWhileCharging",
        "Set the active markers on while charging value for linked devices.",
        {{"Name", "Name of the smart object to update."},
         {"OnWhileCharging", "True if active markers should be kept on while charging."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.\n"),
    Function<&ISmartObjectServices::AutoAssignEnabled>(
        "SmartObjectServices.AutoAssignEnabled", "Get the character auto-assign enabled value of a smart object.",
        {{"Name", "Name of the smart object."}, {"Enabled", "Auto-assign enabled value."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.",
        ELevel::AutoAssign),
    Function<&ISmartObjectServices::SetAutoAssignEnabled>(
        "SmartObjectServices.SetAutoAssignEnabled", "Enable or disable character auto-assignment for a smart object.",
        {{"Name", "Name of the smart object to update."}, {"Enabled", "Auto-assign enabled value."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.",
        ELevel::AutoAssign),
    Function<&ISmartObjectServices::AutoAssignedName>(
        "SmartObjectServices.AutoAssignedName",
        "Get the name auto-assigned to a smart object. Objects are not renamed when auto-assigned to a character "
        "slot. Instead, the name used for data stream output changes to match the slot name.",
        {{"Name", "Name of the smart object."}, {"AutoAssignedName", "Auto-assigned name."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.\n"
        "NotSet - If the subject is not currently assigned, or auto-assign is disabled for the subject.",
        ELevel::AutoAssign),
    Function<&ISmartObjectServices::ProximityGroupName>(
        "SmartObjectServices.ProximityGroupName", "Get the proximity group name for this subject.",
        {{"Name", "Name of the smart object."},
         {"ProximityGroupName", "Name of the proximity group to which this subject belongs."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.",
        ELevel::Grouping),
    Function<&ISmartObjectServices::SetProximityGroupName>(
        "SmartObjectServices.SetProximityGroupName", "Set the proximity group name for this subject.",
        {{"Name", "Name of the smart object to update."},
         {"ProximityGroupName", "Name of the proximity group to which this subject belongs."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.\n",
        ELevel::Grouping),
    Function<&ISmartObjectServices::TemplateGroupName>(
        "SmartObjectServices.TemplateGroupName", "Get the template group name for this subject.",
        {{"Name", "Name of the smart object."},
         {"TemplateGroupName", "Name of the template group to which this subject belongs."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.",
        ELevel::Grouping),
    Function<&ISmartObjectServices::SetTemplateGroupName>(
        "SmartObjectServices.SetTemplateGroupName", "Set the template group name for this subject.",
        {{"Name", "Name of the smart object to update."},
         {"TemplateGroupName", "Name of the template group to which this subject belongs."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.\n",
        ELevel::Grouping),
    Function<&ISmartObjectServices::SmartObjectWarnings>(
        "SmartObjectServices.SmartObjectWarnings", "Get any warnings associated with a smart object.",
        {{"Name", "Name of the smart object."},
         {"Warnings", "Active warning types and descriptions for the smart object."}},
        "Ok - On success.\n"
        "NotFound - If the smart object name supplied is invalid.")};

constexpr TerminalServer2::CallbackRow<ISmartObjectServices> callbacks[] = {
    Callback<&ISmartObjectServices::SmartObjectChangedCallback>(
        "SmartObjectServices.SmartObjectChangedCallback",
        "Callback issued whenever any smart object changes. This includes addition/removal of smart objects and "
        "smart object property changes.")};

}

const TerminalServer2::GroupTable<ISmartObjectServices>& SmartObjectGroup()
{
  static constexpr TerminalServer2::GroupTable<ISmartObjectServices> table{
      {"SmartObjectServices",
       "Functions for managing smart objects. A smart object represents the binding between the object (which "
       "appears in the data-stream) and the physical cluster device. The smart object can be configured in advance "
       "of the device arrival and persists after device disconnection.",
       {}},
      types,
      ELevel::Open,
      functions,
      callbacks};
  return table;
}

}
