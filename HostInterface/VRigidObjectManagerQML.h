#pragma once

#include <QObject>

#include <memory>

class IFlowStateCacheContextProvider;
class IRigidObjectControls;
class IRunaCoreFileIO;
class IRunaCoreUndoManager;
class ISelectionManager;
class ISubjectOriginTools;

namespace NMX
{
class IPostalService;
class IStore;
}

/// The QML singleton by which panels manage rigid objects. There is one in a program: whoever comes first registers it,
/// host or plugin, and it holds the services until it is unregistered. [gui]
class VRigidObjectManagerQML final : public QObject
{
  Q_OBJECT

public:
  [[nodiscard]] static bool IsRegistered();

  /// Registers it as `typeName` 1.0 of the module `uri`. Does nothing when it is registered.
  static void RegisterSingletonQML(std::shared_ptr<NMX::IPostalService> postal, std::shared_ptr<NMX::IStore> store,
                                   std::shared_ptr<ISelectionManager> selectionManager,
                                   std::shared_ptr<IRunaCoreFileIO> fileIO,
                                   std::shared_ptr<IFlowStateCacheContextProvider> contextProvider,
                                   std::shared_ptr<ISubjectOriginTools> originTools,
                                   std::shared_ptr<IRunaCoreUndoManager> undoManager,
                                   std::shared_ptr<IRigidObjectControls> controls, const char* uri,
                                   const char* typeName);

  /// Lets go of the services. QML that still has the singleton finds it not available.
  static void UnregisterSingletonQML();

  /// Whether the services are there: not after it has been unregistered.
  Q_INVOKABLE [[nodiscard]] bool isAvailable() const;

private:
  VRigidObjectManagerQML() = default;
};
