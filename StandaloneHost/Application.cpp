#include "StandaloneHost/Application.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "HostInterface/NotificationSystem/VAsioPostalServiceStrand.h"
#include "HostInterface/RunaCorePluginInterface/IAccessRights.h"
#include "StandaloneHost/Calibration/VCalibrationProvider.h"
#include "StandaloneHost/Characters/VCharacterControls.h"
#include "StandaloneHost/Evaluation/VObjectEvaluationEngine.h"
#include "StandaloneHost/Files/SubjectConfiguration.h"
#include "StandaloneHost/PluginModule.h"
#include "StandaloneHost/Postal/VAsioPostalService.h"
#include "StandaloneHost/Server/VServer.h"
#include "StandaloneHost/Settings/PanelSettings.h"
#include "StandaloneHost/Simulation/HostSimulation.h"
#include "StandaloneHost/SmartObjects/AutoPatternManagement.h"
#include "StandaloneHost/SmartObjects/VSmartObjectControls.h"
#include "StandaloneHost/Store/SqliteArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "StandaloneHost/VFileLocations.h"
#include "StandaloneHost/VPluginHost.h"

#include <csignal>
#include <cstdio>
#include <fstream>
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

/// Tells whoever started the host that calls are served. The file appears whole.
void WriteReadyFile(const std::filesystem::path& file, const std::string& address)
{
  if (file.empty())
    return;
  std::filesystem::path unfinished = file;
  unfinished += ".unfinished";
  {
    std::ofstream out(unfinished);
    out << "{\"url\": \"http://" << address << "\", \"ws\": \"ws://" << address << "/rpc\", \"pid\": " << getpid()
        << "}\n";
    out.flush();
    if (!out)
      throw std::runtime_error("cannot write the ready file \"" + file.string() + "\"");
  }
  std::filesystem::rename(unfinished, file);
}

void WaitForSignal()
{
  sigset_t signals;
  sigemptyset(&signals);
  sigaddset(&signals, SIGINT);
  sigaddset(&signals, SIGTERM);
  int received = 0;
  sigwait(&signals, &received);
}

/// Object evaluation, if the feature is switched on.
std::shared_ptr<Evaluation::VObjectEvaluationEngine> StartEvaluation(const std::shared_ptr<Store::VStore>& store,
                                                                     const Options& options)
{
  if ((options.features & RunaCorePluginInterface::Feature::objectEvaluation) == 0)
    return nullptr;
  return NMX::MakeShared<Evaluation::VObjectEvaluationEngine>(store);
}

/// The order matters: clients go first, then what serves them, then the plugin, and the store last.
void Stop(Server::VServer& server, Characters::VCharacterControls& characters,
          Calibration::VCalibrationProvider& calibration, Postal::VAsioPostalService& postal,
          Evaluation::VObjectEvaluationEngine* evaluation, PluginPointer plugin, std::shared_ptr<Store::VStore> store)
{
  server.Close();    // no client, no outstanding call, no function any more
  characters.Stop(); // the timers that would keep the postal service busy are gone
  calibration.Stop();
  postal.Stop(); // the strands have run empty
  if (evaluation != nullptr)
    evaluation->Stop(); // nobody edits the store any more
  plugin->UnregisterQml();
  plugin.reset();
  store.reset();
}

}

void RunApplication(const Options& options)
{
  auto store = OpenStore(options);
  LoadConfigurations(*store, options);
  const auto locations = std::make_shared<VFileLocations>(options.dataFolder);
  SetUpSettings(*store, *locations);
  PluginPointer plugin = LoadPlugin(options.pluginFile.empty() ? OwnPluginFile() : options.pluginFile);

  const auto postal = NMX::MakeShared<Postal::VAsioPostalService>();
  const auto server = NMX::MakeShared<Server::VServer>(postal, options.server);
  const auto evaluation = StartEvaluation(store, options);
  const auto layouts = std::make_shared<SmartObjects::DeviceLayouts>();
  const auto smartObjects = std::make_shared<SmartObjects::VSmartObjectControls>(store, layouts);
  const auto characters =
      std::make_shared<Characters::VCharacterControls>(store, postal, options.characterCalibrationTime);
  const auto calibration =
      std::make_shared<Calibration::VCalibrationProvider>(store, postal, options.subjectCalibrationTimes);
  // What follows the store's changes has strands of its own.
  const auto patternStrand = NMX::MakeShared<NotificationSystem::VAsioPostalServiceStrand>(postal);
  const auto calibrationStrand = NMX::MakeShared<NotificationSystem::VAsioPostalServiceStrand>(postal);
  std::shared_ptr<const void> patternManagement;
  try
  {
    const auto settings = std::make_shared<VPluginSettings>(
        options.features, HostSettings{locations, smartObjects, evaluation, characters});
    VPluginHost host({store, postal, server, settings, layouts, calibration, std::make_shared<OpenToAll>()});
    (void)plugin->RegisterServices(host);
    Simulation::RegisterGroup(*server, store, NMX::MakeShared<NotificationSystem::VAsioPostalServiceStrand>(postal));
    plugin->RegistrationFinished();
    patternManagement = SmartObjects::ManagePatterns(store, smartObjects, patternStrand);
    calibration->Open(calibrationStrand);
    server->Open();
    WriteReadyFile(options.readyFile, server->Address());
    std::printf("listening on http://%s and ws://%s/rpc\n", server->Address().c_str(), server->Address().c_str());
    std::fflush(stdout);
    WaitForSignal();
  }
  catch (...)
  {
    Stop(*server, *characters, *calibration, *postal, evaluation.get(), std::move(plugin), std::move(store));
    throw;
  }
  Stop(*server, *characters, *calibration, *postal, evaluation.get(), std::move(plugin), std::move(store));
}
