#pragma once

#include "HostInterface/NMX/IResult.h"
#include "HostInterface/NMX/ITypedId.h"

#include <cstdint>
#include <set>
#include <string>

/// What a subject calibration can be asked to do.
enum class ECalibrationAction : std::uint32_t
{
  StartCalibration,
  StartRecalibration,
  AcceptTPose,
  Stop,
  Cancel
};

/// Carries out the calibration of a subject, one at a time. [any]
class ISubjectCalibrationController
{
public:
  ISubjectCalibrationController() = default;
  ISubjectCalibrationController(const ISubjectCalibrationController&) = delete;
  ISubjectCalibrationController& operator=(const ISubjectCalibrationController&) = delete;
  virtual ~ISubjectCalibrationController() = default;

  /// The subject that the next calibration works on. `InvalidId` when there is no such subject.
  virtual NMX::IResult SetTargetSubject(NMX::TSubjectStoreId subject) = 0;

  /// That subject and everything beneath it.
  virtual NMX::IResult SetTargetSubjects(const std::set<NMX::TSubjectStoreId>& subjects) = 0;

  /// Whether the action is possible now; if it is not, `reason` is a sentence for people.
  virtual bool CanPerform(ECalibrationAction action, std::string& reason) const = 0;

  /// Performs the action. To start is to be given a session id; the other actions need that of the run, and are
  /// `InvalidSession` with another. `NotAvailable` when CanPerform would say no. What fails has not happened.
  virtual NMX::IResult Perform(ECalibrationAction action, NMX::TCalibrationSessionId& session) = 0;

  /// 1 while it looks for the T-pose, 2 and 3 while it calibrates; anything else: nothing runs.
  [[nodiscard]] virtual std::uint32_t Phase() const = 0;

  /// The session of the run, or of the last one; 0 when there has been none.
  [[nodiscard]] virtual NMX::TCalibrationSessionId Session() const = 0;

  /// How the last run ended: `NotSet` when there has been none, `Canceled` when it was cancelled.
  [[nodiscard]] virtual NMX::IResult LastResult() const = 0;

  /// Told true right before a fresh calibration is started.
  virtual void SetFreshCalibration(bool fresh) = 0;
};
