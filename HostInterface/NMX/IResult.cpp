#include "HostInterface/NMX/IResult.h"

#include <array>

namespace NMX
{

namespace
{

constexpr std::array<std::string_view, 5> successNames{"Ok", "OkButNoEffect", "OkButPartial", "OkButFinished",
                                                       "OkButModified"};

constexpr std::array<std::string_view, 47> failureNames{"Failed",
                                                        "FailedWithException",
                                                        "Finished",
                                                        "Stopping",
                                                        "NotImplemented",
                                                        "NotSupported",
                                                        "NotPermitted",
                                                        "NotAvailable",
                                                        "NotConnected",
                                                        "NotSet",
                                                        "NotFound",
                                                        "NotRequired",
                                                        "AlreadyPresent",
                                                        "AlreadyInProgress",
                                                        "AlreadySet",
                                                        "InvalidArgument",
                                                        "InvalidIndex",
                                                        "InvalidName",
                                                        "InvalidId",
                                                        "InvalidHandle",
                                                        "InvalidToken",
                                                        "InvalidPointer",
                                                        "InvalidFormat",
                                                        "InvalidType",
                                                        "InvalidVersion",
                                                        "InvalidSession",
                                                        "InvalidInfo",
                                                        "InvalidValue",
                                                        "InvalidSettings",
                                                        "ProtocolFailure",
                                                        "NetworkFailure",
                                                        "AllocationFailure",
                                                        "SerialisationFailure",
                                                        "FileIOFailure",
                                                        "TimedOut",
                                                        "WouldBlock",
                                                        "EndOfData",
                                                        "Conflict",
                                                        "FileNotOpen",
                                                        "ShuttingDown",
                                                        "DiskFull",
                                                        "Canceled",
                                                        "FileNotFound",
                                                        "RPCUnknown",
                                                        "RPCFailed",
                                                        "RPCInvalid",
                                                        "RPCNotConnected"};

constexpr std::uint32_t firstFailure = static_cast<std::uint32_t>(EResult::Failed);

static_assert(successNames.size() == static_cast<std::uint32_t>(EResult::OkButModified) + 1);
static_assert(failureNames.size() == static_cast<std::uint32_t>(EResult::RPCNotConnected) - firstFailure + 1);

}

std::string_view IResult::Name() const
{
  if (m_code < successNames.size())
    return successNames[m_code];
  if (Failed() && m_code - firstFailure < failureNames.size())
    return failureNames[m_code - firstFailure];
  return m_code == static_cast<std::uint32_t>(EResult::NoResult) ? "NoResult" : std::string_view{};
}

}
