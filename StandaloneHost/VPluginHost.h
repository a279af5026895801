#pragma once

#include "HostInterface/RunaCorePluginInterface/IPluginHost.h"
#include "HostInterface/RunaCorePluginInterface/IPluginSettings.h"

#include <cstdint>
#include <memory>

/// The services that this host has.
struct HostServices
{
  std::shared_ptr<NMX::IStore> store;
  std::shared_ptr<NMX::IAsioPostalService> notificationPostal;
  std::shared_ptr<TerminalServer2::IServer> server;
  std::shared_ptr<RunaCorePluginInterface::IPluginSettings> settings;
  std::shared_ptr<RunaCorePluginInterface::IDeviceLayoutRegistry> deviceLayouts;
  std::shared_ptr<RunaCorePluginInterface::ICalibrationProvider> calibration = nullptr;
  std::shared_ptr<RunaCorePluginInterface::IAccessRights> accessRights = nullptr;
  std::shared_ptr<NMX::IPostalService> guiPostal = nullptr;
  std::shared_ptr<IRunaCoreFileIO> fileIO = nullptr;
  std::shared_ptr<ISelectionManager> selection = nullptr;
  std::shared_ptr<RunaCorePluginInterface::IPanelServices> panel = nullptr;
  std::shared_ptr<RunaCorePluginInterface::IObjectPresetProvider> objectPresets = nullptr;
  std::shared_ptr<RunaCorePluginInterface::IOfflineStoreServices> offlineStore = nullptr;
};

/// The standalone host as the plugin sees it. What it does not have it leaves empty. [host]
class VPluginHost final : public RunaCorePluginInterface::IPluginHost
{
public:
  explicit VPluginHost(HostServices services);

  void Store(std::shared_ptr<NMX::IStore>& store) const override;
  void PanelServices(std::shared_ptr<RunaCorePluginInterface::IPanelServices>& services) const override;
  void PostalService(std::shared_ptr<NMX::IPostalService>& postal) const override;
  void NotificationPostalService(std::shared_ptr<NMX::IAsioPostalService>& postal) const override;
  void FileIO(std::shared_ptr<IRunaCoreFileIO>& fileIO) const override;
  void SelectionManager(std::shared_ptr<ISelectionManager>& selectionManager) const override;
  void FlowStateCacheContextProvider(std::shared_ptr<IFlowStateCacheContextProvider>& provider) const override;
  void Server(std::shared_ptr<TerminalServer2::IServer>& server) const override;
  void ObjectPresetProvider(std::shared_ptr<RunaCorePluginInterface::IObjectPresetProvider>& provider) const override;
  void SubjectOriginTools(std::shared_ptr<ISubjectOriginTools>& tools) const override;
  void Settings(std::shared_ptr<RunaCorePluginInterface::IPluginSettings>& settings) const override;
  void DeviceLayoutRegistry(std::shared_ptr<RunaCorePluginInterface::IDeviceLayoutRegistry>& registry) const override;
  void UndoManager(std::shared_ptr<IRunaCoreUndoManager>& undoManager) const override;
  void CalibrationProvider(std::shared_ptr<RunaCorePluginInterface::ICalibrationProvider>& provider) const override;
  void OfflineStoreServices(std::shared_ptr<RunaCorePluginInterface::IOfflineStoreServices>& services) const override;
  void AccessRights(std::shared_ptr<RunaCorePluginInterface::IAccessRights>& rights) const override;

private:
  const HostServices m_services;
};

/// What the services are configured with, where the host has it.
struct HostSettings
{
  std::shared_ptr<IFileLocations> fileLocations;
  std::shared_ptr<ISmartObjectControls> smartObjects;
  std::shared_ptr<RunaCorePluginInterface::IObjectEvaluationSettings> objectEvaluation;
  std::shared_ptr<ICharacterControls> characters;
};

/// The host's settings object: the feature mask of the command line, and what the services are configured with.
class VPluginSettings final : public RunaCorePluginInterface::IPluginSettings
{
public:
  explicit VPluginSettings(std::uint32_t featureMask, HostSettings settings = {});

  void Features(std::shared_ptr<RunaCorePluginInterface::IFeatures>& features) const override;
  void FileLocations(std::shared_ptr<IFileLocations>& locations) const override;
  void SmartObjectControls(std::shared_ptr<ISmartObjectControls>& controls) const override;
  void RigidObjectControls(std::shared_ptr<IRigidObjectControls>& controls) const override;
  void ObjectEvaluationSettings(
      std::shared_ptr<RunaCorePluginInterface::IObjectEvaluationSettings>& settings) const override;
  void CharacterControls(std::shared_ptr<ICharacterControls>& controls) const override;

private:
  const std::shared_ptr<RunaCorePluginInterface::IFeatures> m_features;
  const HostSettings m_settings;
};
