#pragma once

#include "StoreInterface/EntryPath.h"

#include <algorithm>
#include <cstddef>
#include <string_view>

/// The paths of a subject's entries, each numbered on first use.
namespace NMX::Paths
{

/// The text of a path as a template argument.
template <std::size_t size>
struct PathText
{
  consteval PathText(const char (&literal)[size]) { std::copy_n(literal, size, text); }
  char text[size];
};

template <PathText path>
[[nodiscard]] EntryPath PathConstant()
{
  static const EntryPath constant = EntryPath::Constant(path.text);
  return constant;
}

[[nodiscard]] inline EntryPath SubjectId()
{
  return PathConstant<"SubjectId">();
}
[[nodiscard]] inline EntryPath Parameters()
{
  return PathConstant<"Parameters">();
}
[[nodiscard]] inline EntryPath Name()
{
  return PathConstant<"Parameters/Name">();
}
[[nodiscard]] inline EntryPath Enabled()
{
  return PathConstant<"Parameters/Enabled">();
}
[[nodiscard]] inline EntryPath Flags()
{
  return PathConstant<"Parameters/Flags">();
}
[[nodiscard]] inline EntryPath AutoAssignedName()
{
  return PathConstant<"Parameters/AutoAssignedName">();
}
[[nodiscard]] inline EntryPath AutoAssignEnabled()
{
  return PathConstant<"Parameters/AutoAssignEnabled">();
}
[[nodiscard]] inline EntryPath Calibration()
{
  return PathConstant<"Parameters/Calibration">();
}
[[nodiscard]] inline EntryPath ColourRGBA()
{
  return PathConstant<"Parameters/ColourRGBA">();
}
/// How many of its markers an object is recognised by; 0 for the default.
[[nodiscard]] inline EntryPath EntranceThreshold()
{
  return PathConstant<"Parameters/EntranceThreshold">();
}
[[nodiscard]] inline EntryPath FilePath()
{
  return PathConstant<"Parameters/FilePath">();
}
[[nodiscard]] inline EntryPath LinkedCameraURN()
{
  return PathConstant<"Parameters/LinkedCameraURN">();
}
[[nodiscard]] inline EntryPath PresetName()
{
  return PathConstant<"Parameters/PresetName">();
}
[[nodiscard]] inline EntryPath ProximityGroupName()
{
  return PathConstant<"Parameters/ProximityGroupName">();
}
[[nodiscard]] inline EntryPath Retarget()
{
  return PathConstant<"Parameters/Retarget">();
}
[[nodiscard]] inline EntryPath RootSegmentName()
{
  return PathConstant<"Parameters/RootSegmentName">();
}
[[nodiscard]] inline EntryPath TemplateGroupName()
{
  return PathConstant<"Parameters/TemplateGroupName">();
}
[[nodiscard]] inline EntryPath TrackWithObjectTracker()
{
  return PathConstant<"Parameters/TrackWithObjectTracker">();
}
[[nodiscard]] inline EntryPath ParentSubjectId()
{
  return PathConstant<"ParentSubjectId">();
}
[[nodiscard]] inline EntryPath ParentSubjectSlotId()
{
  return PathConstant<"ParentSubjectSlotId">();
}
[[nodiscard]] inline EntryPath Children()
{
  return PathConstant<"Children">();
}
[[nodiscard]] inline EntryPath Roles()
{
  return PathConstant<"Roles">();
}
[[nodiscard]] inline EntryPath RoleLabelling()
{
  return PathConstant<"Roles/Labelling">();
}
[[nodiscard]] inline EntryPath RoleRetargeting()
{
  return PathConstant<"Roles/Retargeting">();
}
[[nodiscard]] inline EntryPath RoleSolving()
{
  return PathConstant<"Roles/Solving">();
}
[[nodiscard]] inline EntryPath ReloadRetargetAction()
{
  return PathConstant<"ReloadRetargetAction">();
}
[[nodiscard]] inline EntryPath SmartObject()
{
  return PathConstant<"SmartObject">();
}
[[nodiscard]] inline EntryPath AdditionalMarkerPositions()
{
  return PathConstant<"SmartObject/AdditionalMarkerPositions">();
}
[[nodiscard]] inline EntryPath MarkersOnWhileCharging()
{
  return PathConstant<"SmartObject/MarkersOnWhileCharging">();
}
[[nodiscard]] inline EntryPath SkinName()
{
  return PathConstant<"SmartObject/SkinName">();
}
[[nodiscard]] inline EntryPath SmartClusters()
{
  return PathConstant<"SmartObject/SmartClusters">();
}
[[nodiscard]] inline EntryPath ModelOutputs()
{
  return PathConstant<"ModelOutputs">();
}
[[nodiscard]] inline EntryPath ModelOutputCGM2()
{
  return PathConstant<"ModelOutputs/CGM2">();
}
[[nodiscard]] inline EntryPath ModelOutputPluginKinex()
{
  return PathConstant<"ModelOutputs/PluginKinex">();
}
[[nodiscard]] inline EntryPath Warnings()
{
  return PathConstant<"Warnings">();
}
[[nodiscard]] inline EntryPath WarningCFCChildWarning()
{
  return PathConstant<"Warnings/WarningCFCChildWarning">();
}
[[nodiscard]] inline EntryPath WarningCFCNoReferenceClusterAssigned()
{
  return PathConstant<"Warnings/WarningCFCNoReferenceClusterAssigned">();
}
[[nodiscard]] inline EntryPath WarningEmptySlot()
{
  return PathConstant<"Warnings/WarningEmptySlot">();
}
[[nodiscard]] inline EntryPath WarningInsufficientAutoAssignCandidates()
{
  return PathConstant<"Warnings/WarningInsufficientAutoAssignCandidates">();
}
[[nodiscard]] inline EntryPath WarningNotCalibrated()
{
  return PathConstant<"Warnings/WarningNotCalibrated">();
}
[[nodiscard]] inline EntryPath WarningObjectConfusion()
{
  return PathConstant<"Warnings/WarningObjectConfusion">();
}
[[nodiscard]] inline EntryPath WarningObjectConfusionCritical()
{
  return PathConstant<"Warnings/WarningObjectConfusionCritical">();
}
/// Whether the host assigns active marker patterns by itself; an application entry.
[[nodiscard]] inline EntryPath AutoPatternManagement()
{
  return PathConstant<"Application/Settings/SmartObjects/AutoPatternManagement">();
}
/// The markers of a basic object, in mm in the object's own frame.
[[nodiscard]] inline EntryPath Markers()
{
  return PathConstant<"Markers">();
}
/// The slots of a character, in its own order.
[[nodiscard]] inline EntryPath Slots()
{
  return PathConstant<"Slots">();
}

}
