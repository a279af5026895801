#pragma once

#include "HostInterface/NMX/IAsioPostalService.h"
#include "StandaloneHost/Simulation/Devices.h"

#include <boost/asio/steady_timer.hpp>

#include <chrono>
#include <map>
#include <memory>
#include <mutex>
#include <string>

namespace Simulation
{

/// The reboots of devices that run. There is nothing to be restarted: a reboot takes its time, and then the device is
/// connected again. [any]
class Reboots : public std::enable_shared_from_this<Reboots>
{
public:
  Reboots(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IAsioPostalService> postal,
          std::chrono::milliseconds duration);

  /// Starts afresh each reboot that the store has as running: those that the host's end interrupted.
  void Resume();

  /// As IDeviceServices::Reboot.
  NMX::IResult Start(const std::string& urn);

  /// Cancels all for good; what is cut short is resumed by the next program.
  void Stop();

private:
  void Arm(const std::string& urn, std::chrono::milliseconds time);
  void Finish(const std::string& urn, const boost::asio::steady_timer* timer) noexcept;
  [[nodiscard]] bool Take(const std::string& urn, const boost::asio::steady_timer* timer);

  const std::shared_ptr<NMX::IAsioPostalService> m_postal;
  const std::chrono::milliseconds m_duration;
  Devices m_devices;
  std::mutex m_mutex; // never held while the store is asked
  std::map<std::string, std::unique_ptr<boost::asio::steady_timer>> m_timers;
  bool m_stopped = false;
};

}
