#include "StandaloneHost/Simulation/VDeviceServices.h"

#include <utility>

namespace Simulation
{

VDeviceServices::VDeviceServices(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IAsioPostalService> postal,
                                 std::chrono::milliseconds rebootTime)
    : m_store(std::move(store)), m_devices(m_store),
      m_reboots(std::make_shared<Reboots>(m_store, std::move(postal), rebootTime))
{
  m_reboots->Resume();
}

void VDeviceServices::Stop()
{
  m_reboots->Stop();
}

std::vector<Device> VDeviceServices::Devices() const
{
  std::vector<Device> devices;
  for (const std::string& urn : m_devices.Urns())
    if (DeviceState state; m_devices.State(urn, state).Succeeded()) // it may have gone just now
      devices.push_back({urn, std::move(state.type), state.connected, state.charging, state.battery});
  return devices;
}

NMX::IResult VDeviceServices::Reboot(const std::string& urn)
{
  return m_reboots->Start(urn);
}

NMX::Subscription VDeviceServices::OnChange(std::weak_ptr<NMX::IPostalService> postal, std::function<void()> handler)
{
  return m_store->OnChange("Application/Devices/*", std::move(postal), std::move(handler));
}

}
