#include "StandaloneHost/Window/VServerStatus.h"

#include <chrono>

namespace Window
{

VServerStatus::VServerStatus(const Server::VServer& server, QObject* parent)
    : QObject(parent), m_server(server), m_last(server.Traffic())
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
  const bool changed = now.connections != m_last.connections || callsPerSecond != m_callsPerSecond;
  m_last = now;
  m_callsPerSecond = callsPerSecond;
  if (changed)
    Q_EMIT sampled();
}

}
