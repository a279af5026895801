#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/VShared.h"

#include <memory>
#include <mutex>
#include <utility>
#include <vector>

namespace NotificationSystem
{

template <class Signature>
class VMultiCallbackPostal;

/// The multi-callback that whoever raises notifications owns and fires. [any]
template <class... Arguments>
class VMultiCallbackPostal<void(Arguments...)> : public NMX::IMultiCallbackPostal<void(Arguments...)>,
                                                 public NMX::VShared
{
public:
  using Handler = typename NMX::IMultiCallbackPostal<void(Arguments...)>::Handler;

  NMX::Subscription Subscribe(std::weak_ptr<NMX::IPostalService> postal, Handler handler) override
  {
    auto subscriber = std::make_shared<const Subscriber>(Subscriber{std::move(postal), std::move(handler)});
    const std::lock_guard lock(m_mutex);
    std::erase_if(m_subscribers, [](const auto& known) { return known.expired(); });
    m_subscribers.emplace_back(subscriber);
    return subscriber;
  }

  /// Posts the notification to every subscriber and returns. No handler runs inside the call.
  void Fire(Arguments... arguments)
  {
    const std::lock_guard lock(m_mutex);
    for (const auto& known : m_subscribers)
    {
      const auto subscriber = known.lock();
      const auto postal = subscriber ? subscriber->postal.lock() : nullptr;
      if (!postal)
        continue;
      postal->Post(
          [known, arguments...]
          {
            if (const auto alive = known.lock())
              alive->handler(arguments...);
          });
    }
  }

private:
  struct Subscriber
  {
    std::weak_ptr<NMX::IPostalService> postal;
    Handler handler;
  };

  std::mutex m_mutex;
  std::vector<std::weak_ptr<const Subscriber>> m_subscribers;
};

}
