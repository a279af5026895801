#include "StandaloneHost/VPluginHost.h"

#include <utility>

using namespace RunaCorePluginInterface;

namespace
{

class VFeatures final : public IFeatures
{
public:
  explicit VFeatures(std::uint32_t mask) : m_mask(mask) {}
  [[nodiscard]] std::uint32_t Mask() const override { return m_mask; }

private:
  const std::uint32_t m_mask;
};

}

VPluginHost::VPluginHost(HostServices services) : m_services(std::move(services)) {}

void VPluginHost::Store(std::shared_ptr<NMX::IStore>& store) const
{
  store = m_services.store;
}

void VPluginHost::PanelServices(std::shared_ptr<IPanelServices>& services) const
{
  services = m_services.panel;
}

void VPluginHost::PostalService(std::shared_ptr<NMX::IPostalService>& postal) const
{
  postal = m_services.guiPostal;
}

void VPluginHost::NotificationPostalService(std::shared_ptr<NMX::IAsioPostalService>& postal) const
{
  postal = m_services.notificationPostal;
}

void VPluginHost::FileIO(std::shared_ptr<IRunaCoreFileIO>& fileIO) const
{
  fileIO = m_services.fileIO;
}

void VPluginHost::SelectionManager(std::shared_ptr<ISelectionManager>& selectionManager) const
{
  selectionManager = m_services.selection;
}

void VPluginHost::FlowStateCacheContextProvider(std::shared_ptr<IFlowStateCacheContextProvider>& provider) const
{
  provider.reset();
}

void VPluginHost::Server(std::shared_ptr<TerminalServer2::IServer>& server) const
{
  server = m_services.server;
}

void VPluginHost::ObjectPresetProvider(std::shared_ptr<IObjectPresetProvider>& provider) const
{
  provider = m_services.objectPresets;
}

void VPluginHost::SubjectOriginTools(std::shared_ptr<ISubjectOriginTools>& tools) const
{
  tools.reset();
}

void VPluginHost::Settings(std::shared_ptr<IPluginSettings>& settings) const
{
  settings = m_services.settings;
}

void VPluginHost::DeviceLayoutRegistry(std::shared_ptr<IDeviceLayoutRegistry>& registry) const
{
  registry = m_services.deviceLayouts;
}

void VPluginHost::UndoManager(std::shared_ptr<IRunaCoreUndoManager>& undoManager) const
{
  undoManager.reset();
}

void VPluginHost::CalibrationProvider(std::shared_ptr<ICalibrationProvider>& provider) const
{
  provider = m_services.calibration;
}

void VPluginHost::OfflineStoreServices(std::shared_ptr<IOfflineStoreServices>& services) const
{
  services = m_services.offlineStore;
}

void VPluginHost::AccessRights(std::shared_ptr<IAccessRights>& rights) const
{
  rights = m_services.accessRights;
}

VPluginSettings::VPluginSettings(std::uint32_t featureMask, HostSettings settings)
    : m_features(std::make_shared<VFeatures>(featureMask)), m_settings(std::move(settings))
{
}

void VPluginSettings::Features(std::shared_ptr<IFeatures>& features) const
{
  features = m_features;
}

void VPluginSettings::FileLocations(std::shared_ptr<IFileLocations>& locations) const
{
  locations = m_settings.fileLocations;
}

void VPluginSettings::SmartObjectControls(std::shared_ptr<ISmartObjectControls>& controls) const
{
  controls = m_settings.smartObjects;
}

void VPluginSettings::RigidObjectControls(std::shared_ptr<IRigidObjectControls>& controls) const
{
  controls.reset();
}

void VPluginSettings::ObjectEvaluationSettings(std::shared_ptr<IObjectEvaluationSettings>& settings) const
{
  settings = m_settings.objectEvaluation;
}

void VPluginSettings::CharacterControls(std::shared_ptr<ICharacterControls>& controls) const
{
  controls = m_settings.characters;
}
