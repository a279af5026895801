#pragma once

#include <memory>

namespace NMX
{
class IPostalService;
class IStore;
}

namespace RunaCorePluginInterface
{

/// The store that a panel without a live stage shows. [gui]
class IOfflineStoreServices
{
public:
  IOfflineStoreServices() = default;
  IOfflineStoreServices(const IOfflineStoreServices&) = delete;
  IOfflineStoreServices& operator=(const IOfflineStoreServices&) = delete;
  virtual ~IOfflineStoreServices() = default;

  virtual void Store(std::shared_ptr<NMX::IStore>& store) const = 0;
  /// Runs tasks on the GUI thread.
  virtual void PostalService(std::shared_ptr<NMX::IPostalService>& postal) const = 0;
};

}
