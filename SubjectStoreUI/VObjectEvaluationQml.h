#pragma once

#include "SubjectStoreUI/ResultGadget.h"

#include <QObject>

#include <memory>

namespace RunaCorePluginInterface
{
class IObjectEvaluationSettings;
}

namespace SubjectStoreUI
{

class ObjectEvaluationWatch;
struct PanelBackend;

/// Object evaluation: whether it runs, and with which settings. [gui]
class VObjectEvaluationQml : public QObject
{
  Q_OBJECT
  Q_PROPERTY(bool enabled READ enabled NOTIFY changed)
  /// Distance in mm below which objects are warned of.
  Q_PROPERTY(double warningThreshold READ warningThreshold NOTIFY changed)
  Q_PROPERTY(double maximumStepCount READ maximumStepCount NOTIFY changed)

public:
  explicit VObjectEvaluationQml(const PanelBackend& backend);
  ~VObjectEvaluationQml() override;

  [[nodiscard]] bool enabled() const;
  [[nodiscard]] double warningThreshold() const;
  [[nodiscard]] double maximumStepCount() const;

  Q_INVOKABLE SubjectStoreUI::VResultGadget setEnabled(bool enabled);
  Q_INVOKABLE SubjectStoreUI::VResultGadget setWarningThreshold(double distance);
  Q_INVOKABLE SubjectStoreUI::VResultGadget setMaximumStepCount(double count);

Q_SIGNALS:
  void changed();

private:
  const std::shared_ptr<RunaCorePluginInterface::IObjectEvaluationSettings> m_settings;
  const std::unique_ptr<ObjectEvaluationWatch> m_watch;
};

}
