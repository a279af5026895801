#pragma once

#include "StoreInterface/IStore.h"

#include <cstdint>
#include <memory>
#include <set>
#include <string>
#include <string_view>

namespace Simulation
{

/// What is known of a device.
struct DeviceState
{
  std::string type;
  bool connected = false;
  bool charging = false;
  std::uint32_t battery = 0; ///< percent
  std::uint32_t radio = 0;   ///< number of the channel; 0 for none
};

/// The devices of the store, which nothing but their entries stands for. Each edit is one commit, whose failure is the
/// answer; `NotFound` for a device that does not exist. [any]
class Devices
{
public:
  explicit Devices(std::shared_ptr<NMX::IStore> store);

  [[nodiscard]] std::set<std::string> Urns() const;
  NMX::IResult State(const std::string& urn, DeviceState& state) const;

  /// Adds a device that is connected and charged. `InvalidArgument` when the URN or the type is empty, or the URN has
  /// a slash or a control character or more than 255 bytes; `AlreadyPresent` when it exists.
  NMX::IResult Add(const std::string& urn, const std::string& type);
  NMX::IResult Remove(const std::string& urn);

  NMX::IResult SetConnected(const std::string& urn, bool connected);
  NMX::IResult SetCharging(const std::string& urn, bool charging);
  /// `InvalidValue` above 100.
  NMX::IResult SetBattery(const std::string& urn, std::uint32_t percent);
  NMX::IResult SetRadio(const std::string& urn, std::uint32_t radio);

  /// Disconnects a device and notes that it is rebooting, so that it is known even to the next program. `NotConnected`
  /// when it is not connected.
  NMX::IResult BeginReboot(const std::string& urn);
  /// Connects a device that is rebooting; without effect on any other.
  NMX::IResult EndReboot(const std::string& urn);
  [[nodiscard]] std::set<std::string> Rebooting() const;

private:
  NMX::IResult Set(const std::string& urn, std::string_view entry, NMX::Value value);
  [[nodiscard]] std::set<std::string> UrnsWith(std::string_view entry) const;

  const std::shared_ptr<NMX::IStore> m_store;
};

}
