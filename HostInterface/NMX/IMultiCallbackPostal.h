#pragma once

#include "HostInterface/NMX/IPostalService.h"

#include <functional>
#include <memory>

namespace NMX
{

/// Keeps a subscription alive; destroying it ends the subscription. After that no call of the handler begins; one
/// that is running on another thread may still be finishing.
using Subscription = std::shared_ptr<const void>;

template <class Signature>
class IMultiCallbackPostal;

/// A change notification with any number of subscribers, each called through a postal service of its own choice.
/// [any]
template <class... Arguments>
class IMultiCallbackPostal<void(Arguments...)>
{
public:
  using Handler = std::function<void(Arguments...)>;

  IMultiCallbackPostal() = default;
  IMultiCallbackPostal(const IMultiCallbackPostal&) = delete;
  IMultiCallbackPostal& operator=(const IMultiCallbackPostal&) = delete;
  virtual ~IMultiCallbackPostal() = default;

  /// Calls `handler` on `postal` for each notification from now on, in the order in which they were raised, for as
  /// long as the returned subscription lives. Notifications are dropped once `postal` is gone.
  [[nodiscard]] virtual Subscription Subscribe(std::weak_ptr<IPostalService> postal, Handler handler) = 0;
};

}
