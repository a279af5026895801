#pragma once

#include "HostInterface/TerminalServer2/Records.h"
#include "RunaCorePluginSubjectStore/SubjectCalibrationServices/ISubjectCalibrationServices.h"

#include <array>

namespace NMX
{

/// The states of subject calibration.
inline constexpr std::array subjectCalibrationStatesValues{
    TerminalServer2::EnumerationValue{
        "None", 0,
        "Subject calibration has not yet been run.  The system is ready to subject calibrate in None, Completed or "
        "Cancelled."},
    TerminalServer2::EnumerationValue{"TPoseLabelling", 1, "The system is attempting to to identify a subject T-Pose."},
    TerminalServer2::EnumerationValue{"Calibrating", 2, "The system is calibrating the subject."},
    TerminalServer2::EnumerationValue{"Completed", 3,
                                      "Subject calibration has completed.  This is an end state of the process."},
    TerminalServer2::EnumerationValue{
        "Cancelled", 4, "The last subject calibration was cancelled.  This is an end state of the process."}};

inline constexpr TerminalServer2::TypeRecord subjectCalibrationStates{
    "SubjectCalibrationServices.ESubjectCalibrationState", "Subject calibration states.",
    subjectCalibrationStatesValues};

constexpr const TerminalServer2::TypeRecord& DocumentedType(ISubjectCalibrationServices::ESubjectCalibrationState)
{
  return subjectCalibrationStates;
}

}
