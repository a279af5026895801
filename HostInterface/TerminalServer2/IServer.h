#pragma once

#include "HostInterface/NMX/IResult.h"
#include "HostInterface/NMX/IServerCallback.h"
#include "HostInterface/NMX/IServerFunction.h"
#include "HostInterface/TerminalServer2/Records.h"

#include <cstdint>
#include <memory>

namespace TerminalServer2
{

/// Who may call: level 2 is open to everyone, level 1 is a preview that the host has to open.
using Level = std::uint32_t;

/// The host's remote-procedure server. What is registered stays until the host withdraws it, which it does before it
/// destroys the plugin. A failed registration leaves out that one thing and nothing else. [host]
class IServer
{
public:
  IServer() = default;
  IServer(const IServer&) = delete;
  IServer& operator=(const IServer&) = delete;
  virtual ~IServer() = default;

  /// Publishes a group's or an enumeration's documentation. `AlreadyPresent` when the name is taken.
  virtual NMX::IResult RegisterType(Level level, const TypeRecord& record) = 0;

  /// Offers a change callback. `InvalidPointer` without one, `AlreadyPresent` when the name is taken.
  virtual NMX::IResult RegisterCallback(Level level, std::shared_ptr<NMX::IServerCallback> callback) = 0;

  /// Offers a function. `InvalidPointer` without one, `AlreadyPresent` when the name is taken.
  virtual NMX::IResult RegisterFunction(Level level, std::shared_ptr<NMX::IServerFunction> function) = 0;
};

}
