#pragma once

#include "HostInterface/IDeviceServices.h"
#include "StandaloneHost/Simulation/Reboots.h"

namespace Simulation
{

/// The devices of the store, for the panel. [any]
class VDeviceServices final : public IDeviceServices
{
public:
  /// A reboot takes `rebootTime`; one that the store has as running goes on.
  VDeviceServices(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IAsioPostalService> postal,
                  std::chrono::milliseconds rebootTime = std::chrono::seconds(2));

  /// Cancels what runs, so that nothing edits the store any more. What is cut short goes on at the next start. [host]
  void Stop();

  [[nodiscard]] std::vector<Device> Devices() const override;
  NMX::IResult Reboot(const std::string& urn) override;
  [[nodiscard]] NMX::Subscription OnChange(std::weak_ptr<NMX::IPostalService> postal,
                                           std::function<void()> handler) override;

private:
  const std::shared_ptr<NMX::IStore> m_store;
  const Simulation::Devices m_devices;
  const std::shared_ptr<Reboots> m_reboots;
};

}
