#include "StandaloneHost/Window/VServerStatus.h"

#include <chrono>
#include <utility>

namespace Window
{

VServerStatus::VServerStatus(const Server::VServer& server, std::function<std::string()> storeFault, QObject* parent)
    : QObject(parent), m_server(server), m_askStoreFault(std::move(storeFault)), m_last(server.Traffic())
{
  m_sinceLast.start();
  connect(&m_timer, &QTimer::timeout, this, &VServerStatus::Sample);
  m_timer.start(std::chrono::seconds(1));
}

void VServerStatus::Sample()
{
  const Server::ServerTraffic now = m_server.Traffic();
  const double seconds = static_cast<double>(m_sinceLast.restart()) / 1000;
  const double calls = static_cast<double>(now.calls - m_last.calls);
  const double callsPerSecond = seconds > 0 ? calls / seconds : 0;
  QString fault = m_askStoreFault ? QString::fromStdString(m_askStoreFault()) : QString{};
  const bool changed =
      now.connections != m_last.connections || callsPerSecond != m_callsPerSecond || fault != m_storeFault;
  m_last = now;
  m_callsPerSecond = callsPerSecond;
  m_storeFault = std::move(fault);
  if (changed)
    Q_EMIT sampled();
}

}
