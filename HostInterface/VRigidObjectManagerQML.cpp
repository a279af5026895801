#include "HostInterface/VRigidObjectManagerQML.h"

#include <QtQml>

#include <optional>
#include <set>
#include <string>
#include <utility>

namespace
{

struct Services
{
  std::shared_ptr<NMX::IPostalService> postal;
  std::shared_ptr<NMX::IStore> store;
  std::shared_ptr<ISelectionManager> selectionManager;
  std::shared_ptr<IRunaCoreFileIO> fileIO;
  std::shared_ptr<IFlowStateCacheContextProvider> contextProvider;
  std::shared_ptr<ISubjectOriginTools> originTools;
  std::shared_ptr<IRunaCoreUndoManager> undoManager;
  std::shared_ptr<IRigidObjectControls> controls;
};

std::optional<Services>& Registered()
{
  static std::optional<Services> services;
  return services;
}

}

bool VRigidObjectManagerQML::IsRegistered()
{
  return Registered().has_value();
}

void VRigidObjectManagerQML::RegisterSingletonQML(
    std::shared_ptr<NMX::IPostalService> postal, std::shared_ptr<NMX::IStore> store,
    std::shared_ptr<ISelectionManager> selectionManager, std::shared_ptr<IRunaCoreFileIO> fileIO,
    std::shared_ptr<IFlowStateCacheContextProvider> contextProvider, std::shared_ptr<ISubjectOriginTools> originTools,
    std::shared_ptr<IRunaCoreUndoManager> undoManager, std::shared_ptr<IRigidObjectControls> controls, const char* uri,
    const char* typeName)
{
  if (IsRegistered())
    return;
  Registered() =
      Services{std::move(postal),          std::move(store),       std::move(selectionManager), std::move(fileIO),
               std::move(contextProvider), std::move(originTools), std::move(undoManager),      std::move(controls)};
  // Qt keeps a type for as long as the program runs: it is given each name once.
  static std::set<std::pair<std::string, std::string>> known;
  if (known.emplace(uri, typeName).second)
    qmlRegisterSingletonType<VRigidObjectManagerQML>(uri, 1, 0, typeName, [](QQmlEngine*, QJSEngine*) -> QObject*
                                                     { return new VRigidObjectManagerQML; });
}

void VRigidObjectManagerQML::UnregisterSingletonQML()
{
  Registered().reset();
}

bool VRigidObjectManagerQML::isAvailable() const
{
  return IsRegistered();
}
