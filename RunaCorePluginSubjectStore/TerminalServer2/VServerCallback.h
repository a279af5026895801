#pragma once

#include "HostInterface/NMX/IMultiCallbackPostal.h"
#include "HostInterface/NMX/IServerCallback.h"
#include "HostInterface/NMX/VShared.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/Signature.h"

#include <memory>
#include <utility>

namespace TerminalServer2
{

template <class Signature, class MultiCallback>
class VServerCallback;

/// One change callback: its record and the service's multi-callback. Notifications reach the server on the group's
/// strand.
template <class... Args>
class VServerCallback<void(Args...), NMX::IMultiCallbackPostal<void(Args...)>> : public NMX::IServerCallback,
                                                                                 public NMX::VShared
{
public:
  using MultiCallback = NMX::IMultiCallbackPostal<void(Args...)>;

  VServerCallback(const FunctionRecord& record, std::shared_ptr<MultiCallback> multiCallback,
                  std::weak_ptr<NMX::IPostalService> strand)
      : m_record(record), m_multiCallback(std::move(multiCallback)), m_strand(std::move(strand))
  {
  }

  [[nodiscard]] const FunctionRecord& Record() const override { return m_record; }
  [[nodiscard]] std::span<const ArgumentType> Arguments() const override { return argumentTypes<Args...>; }

  [[nodiscard]] NMX::Subscription Subscribe(Listener listener) override
  {
    return m_multiCallback->Subscribe(m_strand, [listener = std::move(listener)](Args... arguments)
                                      { listener(Notification(std::move(arguments)...)); });
  }

private:
  struct Notification final : NMX::IServerNotification
  {
    explicit Notification(Args... arguments) : values(std::move(arguments)...) {}

    void WriteArguments(IValueWriter& writer) const override
    {
      std::apply([&](const auto&... value)
                 { (ValueTraits<std::remove_cvref_t<decltype(value)>>::Write(writer, value), ...); }, values);
    }

    ArgumentValues<Args...> values;
  };

  const FunctionRecord m_record;
  const std::shared_ptr<MultiCallback> m_multiCallback;
  const std::weak_ptr<NMX::IPostalService> m_strand;
};

}
