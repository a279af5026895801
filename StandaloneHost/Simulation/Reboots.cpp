#include "StandaloneHost/Simulation/Reboots.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <boost/asio/io_context.hpp>

#include <exception>
#include <utility>

namespace Simulation
{

using NMX::EResult;
using NMX::IResult;

namespace
{

/// How long until a device that could not be connected is tried again.
constexpr std::chrono::seconds retryTime{1};

}

Reboots::Reboots(std::shared_ptr<NMX::IStore> store, std::shared_ptr<NMX::IAsioPostalService> postal,
                 std::chrono::milliseconds duration)
    : m_postal(std::move(postal)), m_duration(duration), m_devices(std::move(store))
{
}

void Reboots::Resume()
{
  for (const std::string& urn : m_devices.Rebooting())
    Arm(urn, m_duration);
}

IResult Reboots::Start(const std::string& urn)
{
  const IResult begun = m_devices.BeginReboot(urn);
  if (begun.Succeeded())
    Arm(urn, m_duration);
  return begun;
}

void Reboots::Stop()
{
  const std::lock_guard lock(m_mutex);
  m_stopped = true;
  m_timers.clear();
}

void Reboots::Arm(const std::string& urn, std::chrono::milliseconds time)
{
  const std::lock_guard lock(m_mutex);
  if (m_stopped)
    return;
  auto timer = std::make_unique<boost::asio::steady_timer>(m_postal->Context(), time);
  timer->async_wait(
      [weak = weak_from_this(), urn, run = timer.get()](const boost::system::error_code& error)
      {
        const auto self = weak.lock();
        if (!error && self)
          self->Finish(urn, run);
      });
  m_timers[urn] = std::move(timer);
}

/// Takes the timer out of those that run. False when it was cancelled or replaced just now.
bool Reboots::Take(const std::string& urn, const boost::asio::steady_timer* timer)
{
  const std::lock_guard lock(m_mutex);
  const auto current = m_timers.find(urn);
  if (current == m_timers.end() || current->second.get() != timer)
    return false;
  m_timers.erase(current);
  return true;
}

void Reboots::Finish(const std::string& urn, const boost::asio::steady_timer* timer) noexcept
{
  try
  {
    if (!Take(urn, timer))
      return;
    const IResult ended = m_devices.EndReboot(urn);
    if (ended.Succeeded() || ended == EResult::NotFound) // it may have gone meanwhile
      return;
    NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "Device %1% cannot be connected again yet: %2%", urn, ended.Name());
    Arm(urn, retryTime);
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "The reboot of device %1% failed: %2%", urn, failure.what());
  }
}

}
