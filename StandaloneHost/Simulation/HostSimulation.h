#pragma once

#include "HostInterface/NMX/IPostalService.h"
#include "HostInterface/TerminalServer2/IServer.h"
#include "StoreInterface/IStore.h"

#include <memory>

namespace Simulation
{

/// Publishes the group "HostSimulation", with which people try out what device states do; a preview. Calls run on
/// `strand`. A registration that the server refuses leaves out that one function. [host]
void RegisterGroup(TerminalServer2::IServer& server, std::shared_ptr<NMX::IStore> store,
                   const std::shared_ptr<NMX::IPostalService>& strand);

}
