#pragma once

#include "HostInterface/NMX/IAsioPostalService.h"
#include "HostInterface/NMX/VShared.h"

#include <memory>

namespace NotificationSystem
{

/// A postal service that runs its tasks one at a time, in the order of posting, on the context of an asio postal
/// service. Each group of the remote API has one. [any]
class VAsioPostalServiceStrand : public NMX::IPostalService, public NMX::VShared
{
public:
  explicit VAsioPostalServiceStrand(std::shared_ptr<NMX::IAsioPostalService> postal);
  ~VAsioPostalServiceStrand() override;

  void Post(std::function<void()> task) override;

private:
  struct State;
  std::unique_ptr<State> m_state;
};

}
