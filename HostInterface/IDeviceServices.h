#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

/// A device that carries the markers of a smart cluster.
struct Device
{
  std::string urn;
  std::string type;
  bool connected = false;
  bool charging = false;
  std::uint32_t battery = 0; ///< percent

  friend bool operator==(const Device&, const Device&) = default;
};

/// The devices that the host knows. [any]
class IDeviceServices
{
public:
  IDeviceServices() = default;
  IDeviceServices(const IDeviceServices&) = delete;
  IDeviceServices& operator=(const IDeviceServices&) = delete;
  virtual ~IDeviceServices() = default;

  /// In ascending order of their URNs.
  [[nodiscard]] virtual std::vector<Device> Devices() const = 0;

  /// Restarts a device. It answers at once; the device is not connected until it is back. `NotFound` for an unknown
  /// device, `NotConnected` for one that cannot be reached.
  virtual NMX::IResult Reboot(const std::string& urn) = 0;

  /// Calls `handler` on `postal` whenever a device came, went or is in another state, for as long as the returned
  /// subscription lives.
  [[nodiscard]] virtual NMX::Subscription OnChange(std::weak_ptr<NMX::IPostalService> postal,
                                                   std::function<void()> handler) = 0;
};
