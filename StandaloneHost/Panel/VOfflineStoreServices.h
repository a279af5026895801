#pragma once

#include "HostInterface/RunaCorePluginInterface/IOfflineStoreServices.h"

#include <memory>
#include <utility>

namespace Panel
{

/// The standalone host has no live stage: its one store is the offline one too. [gui]
class VOfflineStoreServices final : public RunaCorePluginInterface::IOfflineStoreServices
{
public:
  VOfflineStoreServices(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IPostalService> gui)
      : m_store(std::move(store)), m_gui(std::move(gui))
  {
  }

  void Store(std::shared_ptr<NMX::IStore>& store) const override { store = m_store; }
  void PostalService(std::shared_ptr<NMX::IPostalService>& postal) const override { postal = m_gui; }

private:
  const std::shared_ptr<NMX::IStore> m_store;
  const std::shared_ptr<NMX::IPostalService> m_gui;
};

}
