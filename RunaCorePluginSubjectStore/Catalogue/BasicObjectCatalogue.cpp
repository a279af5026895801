#include "RunaCorePluginSubjectStore/Catalogue/BasicObjectCatalogue.h"

#include "RunaCorePluginSubjectStore/BasicObjectServices/BasicObjectWarnings.h"

namespace Catalogue
{

using NMX::IBasicObjectServices;
using TerminalServer2::Callback;
using TerminalServer2::ELevel;
using TerminalServer2::Function;

namespace
{

constexpr const TerminalServer2::TypeRecord* types[] = {&NMX::basicObjectWarnings};

constexpr TerminalServer2::FunctionRow<IBasicObjectServices> functions[] = {
    Function<&IBasicObjectServices::BasicObjectList>(
        "BasicObjectServices.BasicObjectList", "The list of loaded basic object names.",
        {{"Names", "List of basic object names."}}, "Ok - On success."),
    Function<&IBasicObjectServices::Remove>(
        "BasicObjectServices.Remove", "Remove a basic object.", {{"Name", "Basic object name."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is not loaded."),
    Function<&IBasicObjectServices::RemoveAll>(
        "BasicObjectServices.RemoveAll", "Remove all basic objects.", "Ok - On success."),
    Function<&IBasicObjectServices::Rename>(
        "BasicObjectServices.Rename", "Update the basic object name.",
        {{"OldName", "Name of the basic object to update."}, {"NewName", "New basic object name."}},
        "Ok - On success.\n"
        "AlreadyPresent - if the new name is already in use.\n"
        "InvalidName - if the new name contains invalid characters or has leading/trailing spaces.\n"
        "NotFound - If the basic object name supplied is invalid."),
    Function<&IBasicObjectServices::Enabled>(
        "BasicObjectServices.Enabled", "Get the enabled value of a basic object.",
        {{"Name", "Name of the basic object."}, {"Enabled", "Enabled value."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid."),
    Function<&IBasicObjectServices::SetEnabled>(
        "BasicObjectServices.SetEnabled", "Enable or disable a basic object.",
        {{"Name", "Name of the basic object to update."}, {"Enabled", "Enabled value."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid."),
    Function<&IBasicObjectServices::SetAllEnabled>(
        "BasicObjectServices.SetAllEnabled", "Enable or disable all basic objects.", {{"Enabled", "Enabled value."}},
        "Ok - On success."),
    Function<&IBasicObjectServices::Color>(
        "BasicObjectServices.Color", "Get the color of a basic object.",
        {{"Name", "Name of the basic object."}, {"ColorHtml", "HTML hex color code (format '#AARRGGBB')."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid."),
    Function<&IBasicObjectServices::SetColor>(
        "BasicObjectServices.SetColor", "Set the color of a basic object.",
        {{"Name", "Name of the basic object to update."}, {"ColorHtml", "HTML hex color code (format '#AARRGGBB')."}},
        ""),
    Function<&IBasicObjectServices::AutoAssignEnabled>(
        "BasicObjectServices.AutoAssignEnabled", "Get the character auto-assign enabled value of a basic object.",
        {{"Name", "Name of the basic object."}, {"Enabled", "Auto-assign enabled value."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid.",
        ELevel::AutoAssign),
    Function<&IBasicObjectServices::SetAutoAssignEnabled>(
        "BasicObjectServices.SetAutoAssignEnabled", "Enable or disable character auto-assignment for a basic object.",
        {{"Name", "Name of the basic object to update."}, {"Enabled", "Auto-assign enabled value."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid.",
        ELevel::AutoAssign),
    Function<&IBasicObjectServices::AutoAssignedName>(
        "BasicObjectServices.AutoAssignedName",
        "Get the name auto-assigned to a basic object. Objects are not renamed when auto-assigned to a character "
        "slot. Instead, the name used for data stream output changes to match the slot name.",
        {{"Name", "Name of the basic object."}, {"AutoAssignedName", "Auto-assigned name."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid.\n"
        "NotSet - If the subject is not currently assigned, or auto-assign is disabled for the subject.",
        ELevel::AutoAssign),
    Function<&IBasicObjectServices::ProximityGroupName>(
        "BasicObjectServices.ProximityGroupName", "Get the proximity group name for this object.",
        {{"Name", "Name of the basic object."},
         {"ProximityGroupName", "Name of the proximity group to which this object belongs."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid.",
        ELevel::Grouping),
    Function<&IBasicObjectServices::SetProximityGroupName>(
        "BasicObjectServices.SetProximityGroupName", "Set the proximity group name for this object.",
        {{"Name", "Name of the basic object to update."},
         {"ProximityGroupName", "Name of the proximity group to which this object belongs."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid.",
        ELevel::Grouping),
    Function<&IBasicObjectServices::TemplateGroupName>(
        "BasicObjectServices.TemplateGroupName", "Get the template group name for this object.",
        {{"Name", "Name of the basic object."},
         {"TemplateGroupName", "Name of the template group to which this object belongs."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid.",
        ELevel::Grouping),
    Function<&IBasicObjectServices::SetTemplateGroupName>(
        "BasicObjectServices.SetTemplateGroupName", "Set the template group name for this object.",
        {{"Name", "Name of the basic object to update."},
         {"TemplateGroupName", "Name of the template group to which this object belongs."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid.\n",
        ELevel::Grouping),
    Function<&IBasicObjectServices::BasicObjectWarnings>(
        "BasicObjectServices.BasicObjectWarnings", "Get any warnings associated with a basic object.",
        {{"Name", "Name of the basic object."}, {"Warnings", "Active warning types and descriptions for the object."}},
        "Ok - On success.\n"
        "NotFound - If the basic object name supplied is invalid.")};

constexpr TerminalServer2::CallbackRow<IBasicObjectServices> callbacks[] = {
    Callback<&IBasicObjectServices::BasicObjectChangedCallback>(
        "BasicObjectServices.BasicObjectChangedCallback",
        "Callback issued whenever any basic object changes. This includes addition/removal of basic objects and "
        "basic object property changes.")};

}

const TerminalServer2::GroupTable<IBasicObjectServices>& BasicObjectGroup()
{
  static constexpr TerminalServer2::GroupTable<IBasicObjectServices> table{
      {"BasicObjectServices",
       "Functions for managing basic objects. Basic objects are rigid bodies, with a fixed physical marker pattern.",
       {}},
      types,
      ELevel::Open,
      functions,
      callbacks};
  return table;
}

}
