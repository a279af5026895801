#include "SubjectStoreUI/ObjectEvaluationWatch.h"

#include "HostInterface/RunaCorePluginInterface/IObjectEvaluationSettings.h"
#include "SubjectStoreUI/PanelBackend.h"

#include <QPointer>

#include <atomic>

namespace SubjectStoreUI
{

namespace
{

constexpr int intervalInMilliseconds = 50;

}

ObjectEvaluationWatch::ObjectEvaluationWatch(const PanelBackend& backend)
    : m_settings(backend.Get(&RunaCorePluginInterface::IPanelServices::ObjectEvaluationSettings))
{
  m_timer.setSingleShot(true);
  m_timer.setInterval(intervalInMilliseconds);
  connect(&m_timer, &QTimer::timeout, this, &ObjectEvaluationWatch::changed);
  if (!m_settings)
    return;
  // It is told of on any thread and very often: what waits for the GUI thread is never more than one task.
  const auto waits = std::make_shared<std::atomic<bool>>(false);
  m_subscription = m_settings->OnChange(
      [waits, gui = std::weak_ptr(backend.gui), self = QPointer<ObjectEvaluationWatch>(this)]
      {
        const auto postal = gui.lock();
        if (!postal || waits->exchange(true))
          return;
        postal->Post(
            [waits, self]
            {
              *waits = false;
              if (self && !self->m_timer.isActive())
                self->m_timer.start();
            });
      });
}

std::pair<double, double> ObjectEvaluationWatch::Progress() const
{
  std::uint64_t done = 0;
  std::uint64_t required = 0;
  if (!m_settings || m_settings->Progress(done, required).Failed())
    return {0, 0};
  return {static_cast<double>(done), static_cast<double>(required)};
}

}
