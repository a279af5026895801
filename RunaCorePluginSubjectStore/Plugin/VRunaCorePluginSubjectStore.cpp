#include "RunaCorePluginSubjectStore/Plugin/VRunaCorePluginSubjectStore.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "HostInterface/NotificationSystem/VAsioPostalServiceStrand.h"
#include "HostInterface/RunaCorePluginInterface/IPluginHost.h"
#include "HostInterface/RunaCorePluginInterface/IPluginSettings.h"
#include "HostInterface/TerminalServer2/IServer.h"
#include "RunaCorePluginSubjectStore/Catalogue/BasicObjectCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/CharacterFromClustersCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/ObjectEvaluationCatalogue.h"
#include "RunaCorePluginSubjectStore/Catalogue/SmartObjectCatalogue.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"

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

/// Publishes the group of `service` on the host's server, with a strand of its own.
template <class Interface>
void Publish(const IPluginHost& host, const TerminalServer2::GroupTable<Interface>& table,
             const std::shared_ptr<Interface>& service)
{
  std::shared_ptr<TerminalServer2::IServer> server;
  host.Server(server);
  std::shared_ptr<NMX::IAsioPostalService> postal;
  host.NotificationPostalService(postal);
  if (!server || !postal)
  {
    NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "The host has no server for the group %1%.", table.group.name);
    return;
  }
  const auto strand = NMX::MakeShared<NotificationSystem::VAsioPostalServiceStrand>(std::move(postal));
  TerminalServer2::RegisterGroup<Interface>(*server, table, service, strand, FeatureMask(host));
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
    Publish<NMX::IBasicObjectServices>(host, Catalogue::BasicObjectGroup(), service);
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
    Publish<NMX::ISmartObjectServices>(host, Catalogue::SmartObjectGroup(), service);
    m_smartObjectServices = std::move(service);
  }
  if ((FeatureMask(host) & Feature::objectEvaluation) != 0)
  {
    std::shared_ptr<IObjectEvaluationSettings> evaluation;
    Settings(host)->ObjectEvaluationSettings(evaluation);
    auto service = ObjectEvaluationServices::VObjectEvaluationServices::Make(Store(host), std::move(evaluation));
    Publish<NMX::IObjectEvaluationServices>(host, Catalogue::ObjectEvaluationGroup(), service);
    m_objectEvaluationServices = std::move(service);
  }
  if ((FeatureMask(host) & (Feature::characters | Feature::markerless)) != 0)
  {
    std::shared_ptr<ICharacterControls> controls;
    Settings(host)->CharacterControls(controls);
    auto service = NMX::MakeShared<CharacterFromClustersServices::VCharacterFromClustersServices>(std::move(controls),
                                                                                                  Store(host));
    Publish<NMX::ICharacterFromClustersServices>(host, Catalogue::CharacterFromClustersGroup(), service);
    m_characterFromClustersServices = std::move(service);
  }
  return true;
}
