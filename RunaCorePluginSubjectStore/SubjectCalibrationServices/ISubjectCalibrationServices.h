#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"
#include "HostInterface/NMX/ITypedId.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace NMX
{

/// Subject calibration, as the remote group "SubjectCalibrationServices" has it: a run is started, the subject's T-pose
/// is accepted, and the run is stopped, ends by itself or is cancelled.
///
/// A query that begins with Can answers whether something is possible, and if not, why, as a sentence for people. What
/// is not possible is `NotAvailable`. [strand]
class ISubjectCalibrationServices
{
public:
  enum class ESubjectCalibrationState : std::uint32_t
  {
    None,
    TPoseLabelling,
    Calibrating,
    Completed, ///< whatever came of it
    Cancelled
  };

  using CanChangedCallback = IMultiCallbackPostal<void(bool)>;
  using StateChangedCallback = IMultiCallbackPostal<void(TCalibrationSessionId, ESubjectCalibrationState)>;
  using SettingsChangedCallback = IMultiCallbackPostal<void()>;

  virtual ~ISubjectCalibrationServices() = default;

  virtual bool CanStartSubjectCalibration(std::string& reason) const = 0;
  virtual bool CanStartSubjectRecalibration(std::string& reason) const = 0;
  virtual bool CanAcceptTPose(std::string& reason) const = 0;
  virtual bool CanStopSubjectCalibration(std::string& reason) const = 0;
  virtual bool CanCancelSubjectCalibration(std::string& reason) const = 0;

  /// Raised with the new answer whenever that of a query above is another.
  virtual std::shared_ptr<CanChangedCallback> CanStartSubjectCalibrationChangedCallback() = 0;
  virtual std::shared_ptr<CanChangedCallback> CanStartSubjectRecalibrationChangedCallback() = 0;
  virtual std::shared_ptr<CanChangedCallback> CanAcceptTPoseChangedCallback() = 0;
  virtual std::shared_ptr<CanChangedCallback> CanStopSubjectCalibrationChangedCallback() = 0;
  virtual std::shared_ptr<CanChangedCallback> CanCancelSubjectCalibrationChangedCallback() = 0;

  /// Makes a subject of the new subject's name, labelling template and skin, and starts to calibrate it. The subject
  /// stays when the start is refused. `InvalidArgument` for a capture name with one of / : * ? " < > | . , ; \ in it.
  virtual IResult StartSubjectCalibration(TCalibrationSessionId& subjectCalibrationSession,
                                          const std::string& captureName) = 0;

  /// Starts to calibrate the subject again that was named last.
  virtual IResult StartSubjectRecalibration(TCalibrationSessionId& subjectCalibrationSession,
                                            const std::string& captureName) = 0;

  /// `InvalidSession` unless it is the session of the run.
  virtual IResult AcceptTPose(TCalibrationSessionId subjectCalibrationSession) = 0;
  virtual IResult CancelSubjectCalibration(TCalibrationSessionId subjectCalibrationSession) = 0;
  virtual IResult StopSubjectCalibration(TCalibrationSessionId subjectCalibrationSession) = 0;

  /// The session that was started last, 0 when there has been none, and how calibration stands.
  virtual IResult LatestSubjectCalibrationState(TCalibrationSessionId& sessionId,
                                                ESubjectCalibrationState& state) const = 0;

  /// Raised when the state may be another.
  virtual std::shared_ptr<StateChangedCallback> LatestSubjectCalibrationStateChangedCallback() = 0;

  /// The name of the subject that a fresh start makes. If there is one of that name, it is what a recalibration
  /// recalibrates. `InvalidArgument` for a name that does not match the store's name pattern.
  virtual IResult SetNewSubjectName(const std::string& subjectName) = 0;
  virtual IResult NewSubjectName(std::string& subjectName) const = 0;

  /// The names of the templates, and the one that is chosen with the path of its file. `Failed` for one that is not
  /// among them, and when none is chosen.
  virtual IResult SubjectLabellingTemplates(std::vector<std::string>& labellingTemplates) const = 0;
  virtual IResult SetSubjectLabellingTemplate(const std::string& labellingTemplate) = 0;
  virtual IResult SubjectLabellingTemplate(std::string& labellingTemplate,
                                           std::string& labellingTemplatePath) const = 0;

  /// The same of skins.
  virtual IResult SubjectSkins(std::vector<std::string>& skins) const = 0;
  virtual IResult SetSubjectSkin(const std::string& skin) = 0;
  virtual IResult SubjectSkin(std::string& skin, std::string& skinPath) const = 0;

  /// Raised whenever any setting of the subject panel changes.
  virtual std::shared_ptr<SettingsChangedCallback> SubjectCalibrationSettingsChangedCallback() = 0;
};

}
