#pragma once

#include <memory>

class IRunaCoreFileIO;
class IRunaCoreUndoManager;
class ISelectionManager;
class IFlowStateCacheContextProvider;
class ISubjectOriginTools;

namespace NMX
{
class IAsioPostalService;
class IPostalService;
class IStore;
}

namespace TerminalServer2
{
class IServer;
}

namespace RunaCorePluginInterface
{

class IAccessRights;
class ICalibrationProvider;
class IDeviceLayoutRegistry;
class IObjectPresetProvider;
class IOfflineStoreServices;
class IPanelServices;
class IPluginSettings;

/// The host as a plugin sees it: hands out the host's shared services. Each operation fills its argument; a service
/// that the host does not have leaves an empty pointer. [host]
class IPluginHost
{
public:
  IPluginHost() = default;
  IPluginHost(const IPluginHost&) = delete;
  IPluginHost& operator=(const IPluginHost&) = delete;
  virtual ~IPluginHost() = default;

  virtual void Store(std::shared_ptr<NMX::IStore>& store) const = 0;
  virtual void PanelServices(std::shared_ptr<IPanelServices>& services) const = 0;
  /// Runs tasks on the GUI thread.
  virtual void PostalService(std::shared_ptr<NMX::IPostalService>& postal) const = 0;
  /// Carries the API groups' calls and change notifications; each group makes its strand on it.
  virtual void NotificationPostalService(std::shared_ptr<NMX::IAsioPostalService>& postal) const = 0;
  virtual void FileIO(std::shared_ptr<IRunaCoreFileIO>& fileIO) const = 0;
  virtual void SelectionManager(std::shared_ptr<ISelectionManager>& selectionManager) const = 0;
  virtual void FlowStateCacheContextProvider(std::shared_ptr<IFlowStateCacheContextProvider>& provider) const = 0;
  virtual void Server(std::shared_ptr<TerminalServer2::IServer>& server) const = 0;
  virtual void ObjectPresetProvider(std::shared_ptr<IObjectPresetProvider>& provider) const = 0;
  virtual void SubjectOriginTools(std::shared_ptr<ISubjectOriginTools>& tools) const = 0;
  virtual void Settings(std::shared_ptr<IPluginSettings>& settings) const = 0;
  virtual void DeviceLayoutRegistry(std::shared_ptr<IDeviceLayoutRegistry>& registry) const = 0;
  virtual void UndoManager(std::shared_ptr<IRunaCoreUndoManager>& undoManager) const = 0;
  virtual void CalibrationProvider(std::shared_ptr<ICalibrationProvider>& provider) const = 0;
  virtual void OfflineStoreServices(std::shared_ptr<IOfflineStoreServices>& services) const = 0;
  virtual void AccessRights(std::shared_ptr<IAccessRights>& rights) const = 0;
};

}
