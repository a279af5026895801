#pragma once

#include "HostInterface/TerminalServer2/Records.h"
#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/ICharacterFromClustersServices.h"

#include <array>

namespace NMX
{

/// The warnings of a character. "SlotObjectWarning" stands for the entry "Warnings/WarningCFCChildWarning".
inline constexpr std::array characterWarningsValues{
    TerminalServer2::EnumerationValue{"SlotObjectWarning", 0, "Character has one or more warnings on slot objects."},
    TerminalServer2::EnumerationValue{"NotCalibrated", 1, "Character is not calibrated."},
    TerminalServer2::EnumerationValue{
        "CFCNoReferenceClusterAssigned", 2,
        "Character has not been assigned a reference cluster (one with auto-assign disabled)."},
    TerminalServer2::EnumerationValue{
        "InsufficientAutoAssignCandidates", 3,
        "Enabled characters have more empty slots than there are auto-assignable objects."}};

inline constexpr TerminalServer2::TypeRecord characterWarnings{"CharacterFromClustersServices.ECharacterWarning",
                                                               "Character warning types.", characterWarningsValues};

constexpr const TerminalServer2::TypeRecord& DocumentedType(ICharacterFromClustersServices::ECharacterWarning)
{
  return characterWarnings;
}

/// The states of a character's calibration.
inline constexpr std::array characterCalibrationStatesValues{
    TerminalServer2::EnumerationValue{"Uncalibrated", 0, "Character has not been calibrated."},
    TerminalServer2::EnumerationValue{"Calibrating", 1, "Character is in the process of calibration."},
    TerminalServer2::EnumerationValue{"Calibrated", 2, "Character has been calibrated."}};

inline constexpr TerminalServer2::TypeRecord characterCalibrationStates{
    "CharacterFromClustersServices.ECharacterCalibrationState", "Calibration state of a character.",
    characterCalibrationStatesValues};

constexpr const TerminalServer2::TypeRecord& DocumentedType(ICharacterFromClustersServices::ECharacterCalibrationState)
{
  return characterCalibrationStates;
}

}
