#include "SubjectStoreUI/StoreWatch.h"

#include <QPointer>

namespace SubjectStoreUI
{

StoreWatch::StoreWatch(NMX::IStore& store, const std::weak_ptr<NMX::IPostalService>& gui, int intervalInMilliseconds)
{
  m_timer.setSingleShot(true);
  m_timer.setInterval(intervalInMilliseconds);
  connect(&m_timer, &QTimer::timeout, this,
          [this]
          {
            ++m_revision;
            Q_EMIT changed();
          });
  const auto arm = [self = QPointer<StoreWatch>(this)]
  {
    if (self && !self->m_timer.isActive())
      self->m_timer.start();
  };
  m_subscriptions.push_back(store.OnChange("Application/*", gui, arm));
  for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
    m_subscriptions.push_back(store.SubjectsChanged(kind)->Subscribe(gui, arm));
}

}
