#pragma once

#include "HostInterface/NMX/IPostalService.h"

#include <QObject>

#include <mutex>
#include <vector>

namespace Postal
{

/// Runs tasks on the GUI thread: that of whoever creates it, which has an event loop of Qt. [any]
class VGuiPostalService final : public NMX::IPostalService
{
public:
  void Post(std::function<void()> task) override;

  /// What has been posted, and whatever is posted afterwards, never runs. [gui]
  void Stop();

private:
  /// Runs what has been posted until now; what that posts waits for its turn, so that the event loop gets one.
  void Run();

  std::mutex m_mutex;
  std::vector<std::function<void()>> m_tasks;
  bool m_stopped = false;
  QObject m_receiver; ///< lives on the GUI thread
};

}
