#pragma once

#include "HostInterface/ISelectionManager.h"
#include "HostInterface/NMX/IPostalService.h"
#include "StoreInterface/IStore.h"

#include <QObject>
#include <QTimer>

#include <memory>
#include <vector>

namespace SubjectStoreUI
{

/// Tells that something in the store is another, once for all changes of an interval. [gui]
class StoreWatch final : public QObject
{
  Q_OBJECT

public:
  StoreWatch(NMX::IStore& store, const std::weak_ptr<NMX::IPostalService>& gui, int intervalInMilliseconds);

  /// How often it has told.
  [[nodiscard]] int Revision() const { return m_revision; }

Q_SIGNALS:
  void changed();

private:
  QTimer m_timer;
  int m_revision = 0;
  std::vector<NMX::Subscription> m_subscriptions;
};

}
