#include "StandaloneHost/Postal/VGuiPostalService.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <QCoreApplication>
#include <QEvent>

#include <exception>
#include <utility>

namespace Postal
{

void VGuiPostalService::Post(std::function<void()> task)
{
  const std::lock_guard lock(m_mutex);
  if (m_stopped)
    return;
  m_tasks.push_back(std::move(task));
  if (m_tasks.size() == 1)
    QCoreApplication::postEvent(&m_receiver, new QEvent(QEvent::User)); // Qt's from here on
}

void VGuiPostalService::Stop()
{
  std::vector<std::function<void()>> dropped;
  const std::lock_guard lock(m_mutex);
  m_stopped = true;
  dropped.swap(m_tasks);
}

void VGuiPostalService::Run()
{
  std::vector<std::function<void()>> tasks;
  {
    const std::lock_guard lock(m_mutex);
    tasks.swap(m_tasks);
  }
  for (auto& task : tasks)
    try
    {
      std::exchange(task, nullptr)();
    }
    catch (const std::exception& failure)
    {
      // A task must not throw; one that does ends alone.
      NMX::Log(NMX::systemLog, NMX::ESeverity::Critical, "A task of the GUI thread failed: %1%", failure.what());
    }
}

}
