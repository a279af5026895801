#pragma once

#include <cstdint>
#include <string_view>

namespace NMX
{

/// The codes of IResult by name. Success codes count up from 0, failure codes from 0x80000000.
enum class EResult : std::uint32_t
{
  Ok = 0,
  OkButNoEffect,
  OkButPartial,
  OkButFinished,
  OkButModified,

  Failed = 0x80000000,
  FailedWithException,
  Finished,
  Stopping,
  NotImplemented,
  NotSupported,
  NotPermitted,
  NotAvailable,
  NotConnected,
  NotSet,
  NotFound,
  NotRequired,
  AlreadyPresent,
  AlreadyInProgress,
  AlreadySet,
  InvalidArgument,
  InvalidIndex,
  InvalidName,
  InvalidId,
  InvalidHandle,
  InvalidToken,
  InvalidPointer,
  InvalidFormat,
  InvalidType,
  InvalidVersion,
  InvalidSession,
  InvalidInfo,
  InvalidValue,
  InvalidSettings,
  ProtocolFailure,
  NetworkFailure,
  AllocationFailure,
  SerialisationFailure,
  FileIOFailure,
  TimedOut,
  WouldBlock,
  EndOfData,
  Conflict,
  FileNotOpen,
  ShuttingDown,
  DiskFull,
  Canceled,
  FileNotFound,
  RPCUnknown,
  RPCFailed,
  RPCInvalid,
  RPCNotConnected,

  /// What every remote call starts with, and reports when its service produced no result.
  NoResult = 0x80010002
};

/// Outcome of an operation: a 32-bit code, a failure when bit 31 is set.
class [[nodiscard]] IResult
{
public:
  constexpr IResult() = default;
  constexpr IResult(EResult code) : m_code(static_cast<std::uint32_t>(code)) {}
  constexpr explicit IResult(std::uint32_t code) : m_code(code) {}

  [[nodiscard]] constexpr bool Failed() const { return (m_code & 0x80000000U) != 0; }
  [[nodiscard]] constexpr bool Succeeded() const { return !Failed(); }
  [[nodiscard]] constexpr std::uint32_t Code() const { return m_code; }

  /// The code's name, such as "NotFound"; an empty text for a code without one.
  [[nodiscard]] std::string_view Name() const;

  friend constexpr bool operator==(IResult, IResult) = default;

private:
  std::uint32_t m_code = 0;
};

}
