#include "StandaloneHost/Application.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "HostInterface/NotificationSystem/VAsioPostalServiceStrand.h"
#include "HostInterface/RunaCorePluginInterface/IAccessRights.h"
#include "StandaloneHost/Calibration/VCalibrationProvider.h"
#include "StandaloneHost/Characters/VCharacterControls.h"
#include "StandaloneHost/Evaluation/VObjectEvaluationEngine.h"
#include "StandaloneHost/FileIO/VRunaCoreFileIO.h"
#include "StandaloneHost/Files/SubjectConfiguration.h"
#include "StandaloneHost/Logging/LogWriter.h"
#include "StandaloneHost/Panel/VObjectPresetProvider.h"
#include "StandaloneHost/Panel/VOfflineStoreServices.h"
#include "StandaloneHost/Panel/VPanelServices.h"
#include "StandaloneHost/Panel/VSelectionManager.h"
#include "StandaloneHost/PluginModule.h"
#include "StandaloneHost/Postal/VAsioPostalService.h"
#include "StandaloneHost/Postal/VGuiPostalService.h"
#include "StandaloneHost/ReadyFile.h"
#include "StandaloneHost/Server/VServer.h"
#include "StandaloneHost/Settings/PanelSettings.h"
#include "StandaloneHost/Simulation/HostSimulation.h"
#include "StandaloneHost/Simulation/VDeviceServices.h"
#include "StandaloneHost/SmartObjects/AutoPatternManagement.h"
#include "StandaloneHost/SmartObjects/VSmartObjectControls.h"
#include "StandaloneHost/StopSignals.h"
#include "StandaloneHost/Store/SqliteArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "StandaloneHost/VFileLocations.h"
#include "StandaloneHost/VPluginHost.h"
#include "StandaloneHost/Window/Display.h"
#include "StandaloneHost/Window/LogFeed.h"
#include "StandaloneHost/Window/VWindow.h"

#include <optional>
#include <string>
#include <system_error>
#include <unistd.h>

namespace
{

std::shared_ptr<Store::VStore> OpenStore(const Options& options)
{
  const Store::DerivationRules rules{(options.features & RunaCorePluginInterface::Feature::objectAutoAssign) != 0};
  if (!options.dataFolder)
    return NMX::MakeShared<Store::VStore>(rules);
  std::error_code error;
  std::filesystem::create_directories(*options.dataFolder, error);
  if (error)
    throw Store::ArchiveError("cannot use the data folder \"" + options.dataFolder->string() +
                              "\": " + error.message());
  return NMX::MakeShared<Store::VStore>(std::make_unique<Store::SqliteArchive>(*options.dataFolder / "store.sqlite"),
                                        rules);
}

void LoadConfigurations(Store::VStore& store, const Options& options)
{
  if (options.configurations.empty())
    return;
  if (!store.Empty())
  {
    NMX::Log(NMX::systemLog, NMX::ESeverity::Notice, "The store has content; no configuration was loaded.");
    return;
  }
  const auto loaded = Files::LoadSubjectConfigurations(store, options.configurations);
  NMX::Log(NMX::systemLog, NMX::ESeverity::Notice, "Loaded %1% subjects, %2% devices and %3% presets.", loaded.subjects,
           loaded.devices, loaded.presets);
}

void SetUpSettings(Store::VStore& store, const VFileLocations& locations)
{
  const NMX::IResult set = Settings::SetUpPanelSettings(store, {locations.Folders(IFileLocations::characterTemplates),
                                                                locations.Folders(IFileLocations::smartObjectTemplates),
                                                                locations.Folders(IFileLocations::subjectTemplates),
                                                                locations.Folders(IFileLocations::subjectSkins),
                                                                locations.Folders(IFileLocations::retargets)});
  if (set.Failed())
    NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "The settings cannot be brought up to date: %1%", set.Name());
}

/// Everything is open to everybody: who may connect at all is the server's business.
class OpenToAll final : public RunaCorePluginInterface::IAccessRights
{
public:
  [[nodiscard]] bool Granted(std::uint32_t /*right*/) const override { return true; }
};

std::string ReadyText(const Server::VServer& server)
{
  return "{\"url\": \"" + server.Url() + "\", \"ws\": \"" + server.WebSocketUrl() +
         "\", \"pid\": " + std::to_string(getpid()) + "}\n";
}

/// Object evaluation, if the feature is switched on.
std::shared_ptr<Evaluation::VObjectEvaluationEngine> StartEvaluation(const std::shared_ptr<Store::VStore>& store,
                                                                     const Options& options)
{
  if ((options.features & RunaCorePluginInterface::Feature::objectEvaluation) == 0)
    return nullptr;
  return NMX::MakeShared<Evaluation::VObjectEvaluationEngine>(store);
}

/// What runs until the host stops.
struct Parts
{
  std::shared_ptr<Store::VStore> store;
  PluginPointer plugin;
  std::shared_ptr<Postal::VAsioPostalService> postal;
  std::shared_ptr<Postal::VGuiPostalService> gui;
  std::shared_ptr<Server::VServer> server;
  std::shared_ptr<Evaluation::VObjectEvaluationEngine> evaluation; // none when the feature is off
  std::shared_ptr<Characters::VCharacterControls> characters;
  std::shared_ptr<Calibration::VCalibrationProvider> calibration;
  std::shared_ptr<Simulation::VDeviceServices> devices;
  std::shared_ptr<SmartObjects::DeviceLayouts> layouts;
  std::shared_ptr<SmartObjects::VSmartObjectControls> smartObjects;
  std::shared_ptr<VFileLocations> locations;
  std::unique_ptr<Window::VWindow> window; // none when headless
};

/// Opens the store, loads the plugin and makes the services.
Parts MakeParts(const Options& options)
{
  Parts parts;
  const auto& store = parts.store = OpenStore(options);
  LoadConfigurations(*store, options);
  parts.locations = std::make_shared<VFileLocations>(options.dataFolder);
  SetUpSettings(*store, *parts.locations);
  parts.plugin = LoadPlugin(options.pluginFile.empty() ? OwnPluginFile() : options.pluginFile);
  const auto& postal = parts.postal = NMX::MakeShared<Postal::VAsioPostalService>();
  parts.gui = std::make_shared<Postal::VGuiPostalService>();
  parts.server = NMX::MakeShared<Server::VServer>(postal, options.server);
  parts.evaluation = StartEvaluation(store, options);
  parts.layouts = std::make_shared<SmartObjects::DeviceLayouts>();
  parts.smartObjects = std::make_shared<SmartObjects::VSmartObjectControls>(store, parts.layouts);
  parts.characters = std::make_shared<Characters::VCharacterControls>(store, postal, options.characterCalibrationTime);
  parts.calibration =
      std::make_shared<Calibration::VCalibrationProvider>(store, postal, options.subjectCalibrationTimes);
  parts.devices = std::make_shared<Simulation::VDeviceServices>(store, postal);
  return parts;
}

/// The host as the plugin sees it.
HostServices ServicesOf(const Parts& parts, const Options& options)
{
  const auto settings = std::make_shared<VPluginSettings>(
      options.features, HostSettings{parts.locations, parts.smartObjects, parts.evaluation, parts.characters});
  std::shared_ptr<RunaCorePluginInterface::IFeatures> features;
  settings->Features(features);
  HostServices services;
  services.store = parts.store;
  services.notificationPostal = parts.postal;
  services.server = parts.server;
  services.settings = settings;
  services.deviceLayouts = parts.layouts;
  services.calibration = parts.calibration;
  services.accessRights = std::make_shared<OpenToAll>();
  services.guiPostal = parts.gui;
  services.fileIO = std::make_shared<FileIO::VRunaCoreFileIO>(parts.store);
  services.selection = std::make_shared<Panel::VSelectionManager>();
  services.panel = std::make_shared<Panel::VPanelServices>(
      Panel::ServicesForPanel{features, services.fileIO, parts.locations, parts.evaluation, parts.smartObjects,
                              parts.characters, parts.devices, parts.calibration});
  services.objectPresets = std::make_shared<Panel::VObjectPresetProvider>();
  services.offlineStore = std::make_shared<Panel::VOfflineStoreServices>(parts.store, parts.gui);
  return services;
}

/// The order matters: clients go first, then what serves them, then the window, then the plugin, and the store last.
void Stop(Parts& parts)
{
  parts.server->Close();    // no client, no outstanding call, no function any more
  parts.characters->Stop(); // the timers that would keep the postal service busy are gone
  parts.calibration->Stop();
  parts.devices->Stop();
  parts.postal->Stop(); // the strands have run empty
  if (parts.evaluation)
    parts.evaluation->Stop(); // nobody edits the store any more
  parts.gui->Stop();          // nobody tells the window of anything
  parts.window.reset();       // with the QML engine, which uses objects of the plugin
  parts.plugin->UnregisterQml();
  parts.plugin.reset();
  parts.store.reset();
}

/// What the plugin has for the window.
void RegisterWith(Window::VWindow& window, RunaCorePluginInterface::IPlugin& plugin, VPluginHost& host)
{
  (void)plugin.RegisterQml(host, window);
  (void)plugin.RegisterUserInterface(host, window);
}

/// For people, who need not read it.
void PrintAddress(const Server::VServer& server)
{
  const std::string line = "listening on " + server.Url() + " and " + server.WebSocketUrl() + '\n';
  if (!Logging::WriteWithin(STDOUT_FILENO, line, Logging::patience))
    NMX::Log(NMX::systemLog, NMX::ESeverity::Notice, "Nobody takes what is written to standard output.");
}

/// Registers everything, opens the server and runs until somebody ends the program.
void Run(Parts& parts, const Options& options, Window::VLogModel* log)
{
  // What follows the store's changes has strands of its own.
  const auto makeStrand = [&] { return NMX::MakeShared<NotificationSystem::VAsioPostalServiceStrand>(parts.postal); };
  const auto patternStrand = makeStrand();
  const auto calibrationStrand = makeStrand();
  VPluginHost host(ServicesOf(parts, options));
  (void)parts.plugin->RegisterServices(host);
  Simulation::RegisterGroup(*parts.server, parts.store, makeStrand());
  if (log != nullptr)
  {
    parts.window = std::make_unique<Window::VWindow>(*log, options.dataFolder);
    RegisterWith(*parts.window, *parts.plugin, host);
  }
  parts.plugin->RegistrationFinished();
  const auto patternManagement = SmartObjects::ManagePatterns(parts.store, parts.smartObjects, patternStrand);
  parts.calibration->Open(calibrationStrand);
  parts.server->Open();
  if (parts.window)
    parts.window->Show(
        *parts.server, [&plugin = *parts.plugin] { return plugin.CanClose(); },
        [store = parts.store] { return store->Fault(); });
  const ReadyFile readyFile(options.readyFile, ReadyText(*parts.server));
  PrintAddress(*parts.server);
  QCoreApplication::exec();
}

}

void RunApplication(const Options& options)
{
  const bool withWindow = !options.headless && Window::HasDisplay();
  Logging::LogWriter logWriter(STDERR_FILENO);
  const auto eventLoop = Window::MakeEventLoop(withWindow);
  const StopSignals signals;
  Window::VLogModel log;
  std::optional<Window::LogFeed> logFeed;
  if (withWindow)
    logFeed.emplace(logWriter, log);
  Parts parts = MakeParts(options);
  try
  {
    Run(parts, options, withWindow ? &log : nullptr);
  }
  catch (...)
  {
    Stop(parts);
    throw;
  }
  Stop(parts);
}
