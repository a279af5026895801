#pragma once

#include "HostInterface/NMX/IServerFunction.h"
#include "StandaloneHost/Server/Registry.h"
#include "StandaloneHost/Server/ResponseText.h"

#include <cstdint>
#include <string>
#include <string_view>

/// The responses of JSON-RPC as texts. `id` is raw JSON throughout. [any]
namespace Server
{

/// What is wrong with the protocol, or with what it is to carry: `error` with `code` and `message`.
[[nodiscard]] std::string RpcErrorText(std::string_view id, int code, std::string_view message);

/// A call that failed: its code as the wire has it, what the code means for its function, and what more there is to
/// say.
[[nodiscard]] std::string FailureText(std::string_view id, NMX::IResult result, std::string_view meaning,
                                      std::string_view detail);

/// The response to a call that has been carried out.
[[nodiscard]] std::string ReplyText(std::string_view id, const FunctionEntry& entry, const NMX::IServerReply& reply);

/// A call that has been carried out with this result and whose outputs are too long to be sent.
[[nodiscard]] std::string TooLongText(std::string_view id, NMX::IResult result);

/// A call that has not been carried out, as the response to its batch is too long already.
[[nodiscard]] std::string NotBegunText(std::string_view id);

/// A result that is JSON which is there already.
[[nodiscard]] ResponseText SharedResultText(std::string_view id, ResponseText::Shared result);

/// That a subscription began or ended, as of which notification of which start of the host.
[[nodiscard]] std::string SubscribedText(std::string_view id, NMX::IResult result, std::string_view epoch,
                                         std::uint64_t sequence);

}
