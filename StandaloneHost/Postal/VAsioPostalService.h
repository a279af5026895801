#pragma once

#include "HostInterface/NMX/IAsioPostalService.h"
#include "HostInterface/NMX/VShared.h"

#include <memory>

namespace Postal
{

/// The host's input/output thread: one thread that runs one asio context, on which the server and the strands of the
/// API groups live. [any]
class VAsioPostalService : public NMX::IAsioPostalService, public NMX::VShared
{
public:
  /// Starts the thread.
  VAsioPostalService();

  /// The thread has been stopped.
  ~VAsioPostalService() override;

  void Post(std::function<void()> task) override;
  boost::asio::io_context& Context() override;

  /// Runs what has been posted, ends the thread and waits for it. Whatever is posted afterwards never runs. [host]
  void Stop();

private:
  struct State;
  std::unique_ptr<State> m_state;
};

}
