#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/TerminalServer2/ArgumentType.h"
#include "HostInterface/TerminalServer2/IValueWriter.h"
#include "HostInterface/TerminalServer2/Records.h"

#include <functional>
#include <span>

namespace NMX
{

/// The arguments of one notification.
class IServerNotification
{
public:
  /// Writes the arguments in the order of the signature, one call of the writer for each.
  virtual void WriteArguments(TerminalServer2::IValueWriter& writer) const = 0;

protected:
  ~IServerNotification() = default;
};

/// One change callback, to which the server subscribes on behalf of its remote listeners.
class IServerCallback
{
public:
  using Listener = std::function<void(const IServerNotification&)>;

  IServerCallback() = default;
  IServerCallback(const IServerCallback&) = delete;
  IServerCallback& operator=(const IServerCallback&) = delete;
  virtual ~IServerCallback() = default;

  [[nodiscard]] virtual const TerminalServer2::FunctionRecord& Record() const = 0;

  /// One for each argument of the record, in its order.
  [[nodiscard]] virtual std::span<const TerminalServer2::ArgumentType> Arguments() const = 0;

  /// Calls `listener` on the group's strand for each notification, for as long as the subscription lives. [any]
  [[nodiscard]] virtual Subscription Subscribe(Listener listener) = 0;
};

}
