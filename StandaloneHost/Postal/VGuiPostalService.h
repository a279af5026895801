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
  /// Takes the event that wakes the event loop.
  class Receiver final : public QObject
  {
  public:
    explicit Receiver(VGuiPostalService& owner) : m_owner(owner) {}

  protected:
    void customEvent(QEvent* /*event*/) override { m_owner.Run(); }

  private:
    VGuiPostalService& m_owner;
  };

  /// Runs what has been posted until now; what that posts waits for its turn, so that the event loop gets one.
  void Run();

  std::mutex m_mutex;
  std::vector<std::function<void()>> m_tasks;
  bool m_stopped = false;
  Receiver m_receiver{*this}; ///< lives on the GUI thread
};

}
