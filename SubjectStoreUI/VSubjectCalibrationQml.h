#pragma once

#include "SubjectStoreUI/ResultGadget.h"

#include <QObject>

#include <memory>

namespace RunaCorePluginInterface
{
class ICalibrationProvider;
}

namespace SubjectStoreUI
{

struct PanelBackend;

/// The calibration of subjects: what goes on, and what can be done now and why not. Its settings (name, template, skin)
/// are parameters of SubjectStore.subjectSetupParameterModel. [gui]
class VSubjectCalibrationQml : public QObject
{
  Q_OBJECT
  /// "Not running", "Looking for the T-pose", … in words.
  Q_PROPERTY(QString state READ state NOTIFY changed)
  Q_PROPERTY(bool running READ running NOTIFY changed)
  /// How the last run ended, in words; empty when there has been none.
  Q_PROPERTY(QString lastResult READ lastResult NOTIFY changed)
  // What is possible; the reason why not is empty when it is.
  Q_PROPERTY(QString cannotStart READ cannotStart NOTIFY changed)
  Q_PROPERTY(QString cannotRecalibrate READ cannotRecalibrate NOTIFY changed)
  Q_PROPERTY(QString cannotAcceptTPose READ cannotAcceptTPose NOTIFY changed)
  Q_PROPERTY(QString cannotStop READ cannotStop NOTIFY changed)
  Q_PROPERTY(QString cannotCancel READ cannotCancel NOTIFY changed)

public:
  VSubjectCalibrationQml(const PanelBackend& backend, const RunaCorePluginInterface::ICalibrationProvider& provider);
  ~VSubjectCalibrationQml() override;

  [[nodiscard]] QString state() const;
  [[nodiscard]] bool running() const;
  [[nodiscard]] QString lastResult() const;
  [[nodiscard]] QString cannotStart() const;
  [[nodiscard]] QString cannotRecalibrate() const;
  [[nodiscard]] QString cannotAcceptTPose() const;
  [[nodiscard]] QString cannotStop() const;
  [[nodiscard]] QString cannotCancel() const;

  /// Makes the subject of the settings and calibrates it.
  Q_INVOKABLE SubjectStoreUI::VResultGadget start();
  /// Calibrates the subject that has the name of the settings already.
  Q_INVOKABLE SubjectStoreUI::VResultGadget recalibrate();
  Q_INVOKABLE SubjectStoreUI::VResultGadget acceptTPose();
  Q_INVOKABLE SubjectStoreUI::VResultGadget stop();
  Q_INVOKABLE SubjectStoreUI::VResultGadget cancel();

Q_SIGNALS:
  void changed();

private:
  struct Implementation;
  const std::unique_ptr<Implementation> m_implementation;
};

}
