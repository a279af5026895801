#pragma once

#include "HostInterface/NMX/IPostalService.h"
#include "StoreInterface/IStore.h"

#include <QAbstractItemModel>
#include <QObject>

#include <memory>

class QQmlContext;

namespace SubjectStoreUI
{

class VSubjectListModelStore;

/// What a panel without a live stage shows: a list of all subjects. [gui]
class VSubjectStoreOfflineQml : public QObject
{
  Q_OBJECT
  /// VSubjectListModelStore; null without a store.
  Q_PROPERTY(QAbstractItemModel* subjectsListModel READ subjectsListModel CONSTANT)

public:
  VSubjectStoreOfflineQml(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IPostalService> gui);
  ~VSubjectStoreOfflineQml() override;

  [[nodiscard]] QAbstractItemModel* subjectsListModel() const;

private:
  const std::shared_ptr<NMX::IStore> m_store;
  const std::shared_ptr<NMX::IPostalService> m_gui;
  const std::shared_ptr<VSubjectListModelStore> m_list;
};

/// Publishes the object as "rootContextSubjectStoreOffline", by which the module's QML knows it, and as
/// "SubjectStoreOffline". The object outlives whatever QML does with it.
void PublishOffline(QQmlContext& rootContext, VSubjectStoreOfflineQml& offline);

}
