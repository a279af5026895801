#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"

#include <QObject>
#include <QTimer>

#include <memory>
#include <utility>

namespace RunaCorePluginInterface
{
class IObjectEvaluationSettings;
}

namespace SubjectStoreUI
{

struct PanelBackend;

/// Tells on the GUI thread that object evaluation has another setting, another progress or another finding: once for
/// all changes of an interval. [gui]
class ObjectEvaluationWatch final : public QObject
{
  Q_OBJECT

public:
  explicit ObjectEvaluationWatch(const PanelBackend& backend);

  /// Comparisons done and required; both 0 while evaluation is off.
  [[nodiscard]] std::pair<double, double> Progress() const;

Q_SIGNALS:
  void changed();

private:
  const std::shared_ptr<RunaCorePluginInterface::IObjectEvaluationSettings> m_settings;
  QTimer m_timer;
  NMX::Subscription m_subscription;
};

}
