#pragma once

#include "HostInterface/NMX/Caller.h"
#include "StandaloneHost/Server/ApiDocuments.h"
#include "StandaloneHost/Server/Envelope.h"
#include "StandaloneHost/Server/Notifier.h"
#include "StandaloneHost/Server/OutgoingBytes.h"
#include "StandaloneHost/Server/Registry.h"
#include "StandaloneHost/Server/ResponseText.h"

#include <atomic>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace Server
{

struct SubscriptionText;

/// Receives the answer to one message, an empty text when there is none to give, and how many calls it was for.
using Answer = std::function<void(ResponseText text, std::size_t calls)>;

/// Carries out the messages of clients: finds the function of each call, puts its arguments in order, and words the
/// answers. [server]
class Dispatcher
{
public:
  Dispatcher(const Registry& registry, Notifier& notifier, const Limits& limits,
             std::shared_ptr<OutgoingBytes> outgoing, TerminalServer2::Level grantedLevel, std::string epoch);

  /// Carries out one message. `answer` is called exactly once, perhaps before this returns. `listener` is the client
  /// as one that can be told of changes; null when its transport cannot. Returns how many calls were begun.
  std::size_t Handle(std::string_view text, const NMX::Caller& caller, IListener* listener, Answer answer);

  /// How many calls have been begun. [any]
  [[nodiscard]] std::uint64_t Calls() const { return m_calls.load(std::memory_order_relaxed); }

  /// The greeting for a new client.
  [[nodiscard]] std::string Hello(std::uint64_t session) const;

  /// The description of everything that is offered.
  [[nodiscard]] const ApiDocuments& Api() const;

private:
  struct Batch;

  /// Where the response to one request goes: to whoever sent it, or to the batch that it is part of.
  struct Recipient
  {
    /// `result` tells what an answer that is too long came to. An empty text stands for no response.
    void Take(std::string_view id, ResponseText text, NMX::IResult result) const;

    Answer answer;
    std::shared_ptr<Batch> batch; ///< null for a request on its own
    const OutgoingBytes* outgoing;
  };

  void HandleRequest(const Request& request, const NMX::Caller& caller, IListener* listener, Recipient recipient);
  void Call(const FunctionEntry& entry, const Request& request, const NMX::Caller& caller, Recipient recipient);
  void CallServer(const Request& request, IListener* listener, const Recipient& recipient);
  [[nodiscard]] std::string Subscribe(const Request& request, IListener* listener);
  [[nodiscard]] std::string Subscription(const SubscriptionText& text, const Request& request, IListener* listener);

  const Registry& m_registry;
  Notifier& m_notifier;
  const Limits& m_limits;
  const std::shared_ptr<OutgoingBytes> m_outgoing;
  const TerminalServer2::Level m_grantedLevel;
  const std::string m_epoch;
  mutable ApiDocuments m_api; // made when first asked for
  std::atomic<std::uint64_t> m_calls{0};
};

}
