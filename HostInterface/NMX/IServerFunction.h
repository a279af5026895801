#pragma once

#include "HostInterface/NMX/Caller.h"
#include "HostInterface/NMX/IResult.h"
#include "HostInterface/TerminalServer2/ArgumentType.h"
#include "HostInterface/TerminalServer2/IValueWriter.h"
#include "HostInterface/TerminalServer2/Records.h"

#include <functional>
#include <optional>
#include <span>
#include <string_view>

namespace NMX
{

/// The finished answer to one call.
class IServerReply
{
public:
  [[nodiscard]] virtual IResult Result() const = 0;

  /// What was wrong with the arguments, and where; empty for every answer that comes from the service.
  [[nodiscard]] virtual std::string_view Text() const = 0;

  /// The truth value of a query that returns one instead of a result.
  [[nodiscard]] virtual std::optional<bool> Returned() const = 0;

  /// Writes the output arguments in the order of the signature, one call of the writer for each.
  virtual void WriteOutputs(TerminalServer2::IValueWriter& writer) const = 0;

protected:
  ~IServerReply() = default;
};

/// One API function as the server calls it.
class IServerFunction
{
public:
  using Completion = std::function<void(const IServerReply&)>;

  IServerFunction() = default;
  IServerFunction(const IServerFunction&) = delete;
  IServerFunction& operator=(const IServerFunction&) = delete;
  virtual ~IServerFunction() = default;

  [[nodiscard]] virtual const TerminalServer2::FunctionRecord& Record() const = 0;

  /// One for each argument of the record, in its order.
  [[nodiscard]] virtual std::span<const TerminalServer2::ArgumentType> Arguments() const = 0;

  /// True when the function answers a truth value beside its outputs, instead of a result.
  [[nodiscard]] virtual bool ReturnsTruth() const = 0;

  /// Reads the inputs, a JSON array, from the front of the request text and steps past what was read; then runs the
  /// call. `completion` is called exactly once: inside Invoke when the arguments are refused, otherwise on the
  /// group's strand. The calls of a group run in the order of Invoke, but while one waits for a file, only those of its
  /// caller wait behind it. The function stays until its calls have been finished. [server]
  virtual void Invoke(std::string_view& argumentText, const Caller& caller, Completion completion) = 0;

  /// Finishes every call that was accepted and has not run yet, or waits for a file, with `result`; none of them will
  /// run. [any]
  virtual void FinishOutstanding(IResult result) = 0;
};

}
