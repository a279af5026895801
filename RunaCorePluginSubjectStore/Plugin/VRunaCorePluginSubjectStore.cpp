#include "RunaCorePluginSubjectStore/Plugin/VRunaCorePluginSubjectStore.h"

#include "HostInterface/ISmartObjectControls.h"
#include "HostInterface/NMX/GlobalLog.h"
#include "HostInterface/NotificationSystem/VAsioPostalServiceStrand.h"
#include "HostInterface/RunaCorePluginInterface/IAccessRights.h"
#include "HostInterface/RunaCorePluginInterface/IObjectPresetProvider.h"
#include "HostInterface/RunaCorePluginInterface/IOfflineStoreServices.h"
#include "HostInterface/RunaCorePluginInterface/IPanelServices.h"
#include "HostInterface/RunaCorePluginInterface/IPluginHost.h"
#include "HostInterface/RunaCorePluginInterface/IPluginSettings.h"
#include "HostInterface/RunaCorePluginInterface/IQmlContext.h"
#include "HostInterface/RunaCorePluginInterface/IUserInterface.h"
#include "HostInterface/TerminalServer2/IServer.h"
#include "HostInterface/VRigidObjectManagerQML.h"
#include "RunaCorePluginSubjectStore/Catalogue/BasicObjectCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/CharacterFromClustersCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/ObjectEvaluationCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/SmartObjectCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/SubjectCalibrationCatalogue.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"
#include "StoreUI/ResultSentence.h"
#include "SubjectStoreUI/QmlRegistration.h"

#include <utility>

using namespace RunaCorePluginInterface;

namespace
{

std::shared_ptr<IPluginSettings> Settings(const IPluginHost& host)
{
  std::shared_ptr<IPluginSettings> settings;
  host.Settings(settings);
  return settings;
}

/// The feature mask as it is now. The host may change it at any time, so nobody keeps it.
std::uint32_t FeatureMask(const IPluginHost& host)
{
  std::shared_ptr<IFeatures> features;
  if (const auto settings = Settings(host))
    settings->Features(features);
  return features ? features->Mask() : 0;
}

std::shared_ptr<NMX::IStore> Store(const IPluginHost& host)
{
  std::shared_ptr<NMX::IStore> store;
  host.Store(store);
  return store;
}

bool SubjectCalibrationGranted(const IPluginHost& host)
{
  std::shared_ptr<IAccessRights> rights;
  host.AccessRights(rights);
  return rights && rights->Granted(AccessRight::subjectCalibration);
}

/// A strand for a group's calls and notifications; null in a host that has nothing to carry them.
std::shared_ptr<NMX::IPostalService> MakeStrand(const IPluginHost& host)
{
  std::shared_ptr<NMX::IAsioPostalService> postal;
  host.NotificationPostalService(postal);
  return postal ? NMX::MakeShared<NotificationSystem::VAsioPostalServiceStrand>(std::move(postal)) : nullptr;
}

/// What one of the host's operations hands out; null when the host has none.
template <class Service>
std::shared_ptr<Service> Get(const IPluginHost& host, void (IPluginHost::*getter)(std::shared_ptr<Service>&) const)
{
  std::shared_ptr<Service> service;
  (host.*getter)(service);
  return service;
}

/// Registers the rigid-object manager, if nobody has and the host has what it takes.
void RegisterRigidObjectManager(const IPluginHost& host)
{
  if (VRigidObjectManagerQML::IsRegistered())
    return;
  const auto originTools = Get(host, &IPluginHost::SubjectOriginTools);
  std::shared_ptr<IRigidObjectControls> controls;
  if (const auto settings = Settings(host))
    settings->RigidObjectControls(controls);
  if (!originTools || !controls)
    return;
  VRigidObjectManagerQML::RegisterSingletonQML(
      Get(host, &IPluginHost::PostalService), Store(host), Get(host, &IPluginHost::SelectionManager),
      Get(host, &IPluginHost::FileIO), Get(host, &IPluginHost::FlowStateCacheContextProvider), originTools,
      Get(host, &IPluginHost::UndoManager), controls, "Tavix.RunaCore.RigidObjectManager", "RigidObjectManager");
}

/// Publishes the group of `service` on the host's server.
template <class Interface>
void Publish(const IPluginHost& host, const TerminalServer2::GroupTable<Interface>& table,
             const std::shared_ptr<Interface>& service, const std::shared_ptr<NMX::IPostalService>& strand)
{
  std::shared_ptr<TerminalServer2::IServer> server;
  host.Server(server);
  if (!server || !strand)
  {
    NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "The host has no server for the group %1%.", table.group.name);
    return;
  }
  TerminalServer2::RegisterGroup<Interface>(*server, table, service, strand,
                                            {FeatureMask(host), SubjectCalibrationGranted(host)});
}

}

const char* VRunaCorePluginSubjectStore::DisplayName() const
{
  return "Subject and object UI";
}

bool VRunaCorePluginSubjectStore::RegisterServices(IPluginHost& host)
{
  if ((FeatureMask(host) & Feature::basicObjects) != 0)
  {
    auto service = NMX::MakeShared<BasicObjectServices::VBasicObjectServices>(Store(host));
    Publish<NMX::IBasicObjectServices>(host, Catalogue::BasicObjectGroup(), service, MakeStrand(host));
    m_basicObjectServices = std::move(service);
  }
  if ((FeatureMask(host) & Feature::smartObjects) != 0)
  {
    std::shared_ptr<IDeviceLayoutRegistry> layouts;
    host.DeviceLayoutRegistry(layouts);
    if (layouts)
      SmartObjectServices::RegisterDeviceTypes(*layouts);
    std::shared_ptr<ISmartObjectControls> controls;
    Settings(host)->SmartObjectControls(controls);
    std::shared_ptr<IFileLocations> locations;
    Settings(host)->FileLocations(locations);
    auto service = NMX::MakeShared<SmartObjectServices::VSmartObjectServices>(Store(host), std::move(controls),
                                                                              std::move(locations));
    Publish<NMX::ISmartObjectServices>(host, Catalogue::SmartObjectGroup(), service, MakeStrand(host));
    m_smartObjectServices = std::move(service);
  }
  if ((FeatureMask(host) & Feature::objectEvaluation) != 0)
  {
    std::shared_ptr<IObjectEvaluationSettings> evaluation;
    Settings(host)->ObjectEvaluationSettings(evaluation);
    auto service = ObjectEvaluationServices::VObjectEvaluationServices::Make(Store(host), std::move(evaluation));
    Publish<NMX::IObjectEvaluationServices>(host, Catalogue::ObjectEvaluationGroup(), service, MakeStrand(host));
    m_objectEvaluationServices = std::move(service);
  }
  if ((FeatureMask(host) & (Feature::characters | Feature::markerless)) != 0)
  {
    std::shared_ptr<ICharacterControls> controls;
    Settings(host)->CharacterControls(controls);
    auto service = NMX::MakeShared<CharacterFromClustersServices::VCharacterFromClustersServices>(std::move(controls),
                                                                                                  Store(host));
    Publish<NMX::ICharacterFromClustersServices>(host, Catalogue::CharacterFromClustersGroup(), service,
                                                 MakeStrand(host));
    m_characterFromClustersServices = std::move(service);
  }
  std::shared_ptr<ICalibrationProvider> calibration;
  host.CalibrationProvider(calibration);
  if (calibration)
    RegisterSubjectCalibration(host, *calibration);
  return true;
}

void VRunaCorePluginSubjectStore::RegisterSubjectCalibration(const IPluginHost& host,
                                                             const ICalibrationProvider& provider)
{
  std::shared_ptr<ISubjectCalibrationController> controller;
  provider.Controller(controller);
  std::shared_ptr<ISubjectCreator> creator;
  provider.SubjectCreator(creator);
  std::shared_ptr<ICalibrationNotifications> notifications;
  provider.Notifications(notifications);
  const auto strand = MakeStrand(host); // before the service, which hears of notifications on it
  auto service = SubjectCalibrationServices::VSubjectCalibrationServices::Make(
      Store(host), std::move(controller), std::move(creator), *notifications, strand);
  Publish<NMX::ISubjectCalibrationServices>(host, Catalogue::SubjectCalibrationGroup(), service, strand);
  m_subjectCalibrationServices = std::move(service);
}

bool VRunaCorePluginSubjectStore::RegisterQml(IPluginHost& host, IQmlContext& qmlContext)
{
  const auto gui = Get(host, &IPluginHost::PostalService);
  const auto store = Store(host);
  if (!gui || !store)
  {
    NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "The host has no store or no GUI thread for the subject panel.");
    return false;
  }
  RegisterRigidObjectManager(host);
  SubjectStoreUI::RegisterModule();
  SubjectStoreUI::AddModuleFiles(qmlContext.Engine());
  std::shared_ptr<IObjectPresetProvider> presets;
  if ((FeatureMask(host) & Feature::objectPresets) != 0)
    presets = Get(host, &IPluginHost::ObjectPresetProvider);
  m_subjectStoreQml = std::make_unique<SubjectStoreUI::VSubjectStoreQml>(
      &qmlContext.RootContext(), Get(host, &IPluginHost::SelectionManager), Get(host, &IPluginHost::PanelServices), gui,
      store);
  m_subjectStoreQml->SetObjectPresetProvider(std::move(presets));

  std::shared_ptr<NMX::IStore> offlineStore;
  std::shared_ptr<NMX::IPostalService> offlinePostal;
  if (const auto offline = Get(host, &IPluginHost::OfflineStoreServices))
  {
    offline->Store(offlineStore);
    offline->PostalService(offlinePostal);
  }
  m_subjectStoreOfflineQml =
      std::make_unique<SubjectStoreUI::VSubjectStoreOfflineQml>(std::move(offlineStore), std::move(offlinePostal));
  SubjectStoreUI::PublishOffline(qmlContext.RootContext(), *m_subjectStoreOfflineQml);
  return true;
}

bool VRunaCorePluginSubjectStore::RegisterUserInterface(IPluginHost& host, IUserInterface& userInterface)
{
  std::shared_ptr<ISmartObjectControls> controls;
  if (const auto settings = Settings(host))
    settings->SmartObjectControls(controls);
  MenuCommand command;
  command.menu = "&Edit";
  command.text = "Assign &Smart Object Patterns";
  command.shortcut = "Ctrl+Shift+P";
  command.toolTip = "Give every smart cluster an active marker pattern of its own";
  command.colour = userInterface.ThemeColour("highlight");
  command.possible = [controls, store = Store(host)](std::string& reason)
  {
    std::vector<NMX::TSubjectStoreId> objects;
    const bool any =
        store && store->Reader()->Subjects(NMX::ESubjectKind::SmartObjects, objects).Succeeded() && !objects.empty();
    if (!controls)
      reason = "This host has no active markers.";
    else if (!any)
      reason = "There are no smart objects.";
    return controls && any;
  };
  command.trigger = [controls](std::string& reason) -> NMX::IResult
  {
    const NMX::IResult assigned =
        controls ? controls->AssignOptimalPatterns() : NMX::IResult(NMX::EResult::NotAvailable);
    if (assigned.Failed())
      reason = StoreUI::PatternSentence(assigned);
    return assigned;
  };
  userInterface.AddCommand(std::move(command));
  return true;
}

void VRunaCorePluginSubjectStore::UnregisterQml()
{
  VRigidObjectManagerQML::UnregisterSingletonQML();
}
