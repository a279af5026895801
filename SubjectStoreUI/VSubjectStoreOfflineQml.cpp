#include "SubjectStoreUI/VSubjectStoreOfflineQml.h"

#include "SubjectStoreUI/VSubjectListModelStore.h"
#include "SubjectStoreUI/VSubjectModelInternalData.h"

#include <QQmlContext>
#include <QQmlEngine>

#include <utility>

namespace SubjectStoreUI
{

namespace
{

constexpr int batchingIntervalInMilliseconds = 100;

std::shared_ptr<VSubjectListModelStore> MakeList(const std::shared_ptr<NMX::IStore>& store,
                                                 const std::shared_ptr<NMX::IPostalService>& gui)
{
  if (!store)
    return nullptr;
  auto list = NMX::MakeShared<VSubjectListModelStore>(std::make_shared<VSubjectModelInternalData>(store, gui));
  list->followStore(batchingIntervalInMilliseconds);
  QQmlEngine::setObjectOwnership(list.get(), QQmlEngine::CppOwnership);
  return list;
}

}

VSubjectStoreOfflineQml::VSubjectStoreOfflineQml(std::shared_ptr<NMX::IStore> store,
                                                 std::shared_ptr<NMX::IPostalService> gui)
    : m_store(std::move(store)), m_gui(std::move(gui)), m_list(MakeList(m_store, m_gui))
{
}

VSubjectStoreOfflineQml::~VSubjectStoreOfflineQml() = default;

QAbstractItemModel* VSubjectStoreOfflineQml::subjectsListModel() const
{
  return m_list.get();
}

void PublishOffline(QQmlContext& rootContext, VSubjectStoreOfflineQml& offline)
{
  rootContext.setContextProperty("rootContextSubjectStoreOffline", &offline);
  rootContext.setContextProperty("SubjectStoreOffline", &offline);
}

}
