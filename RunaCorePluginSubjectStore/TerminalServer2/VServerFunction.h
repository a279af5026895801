#pragma once

#include "RunaCorePluginSubjectStore/TerminalServer2/ServerFunctionBase.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/Signature.h"

#include <functional>
#include <memory>
#include <optional>
#include <type_traits>
#include <utility>

namespace TerminalServer2
{

template <class Signature>
class VServerFunction;

/// One API function: its record, and a callable of the service. `Result` is IResult, or bool for a query that answers
/// a truth value. The callable holds the service, which therefore lives at least as long as the function.
template <class ReturnType, class... Args>
class VServerFunction<ReturnType(Args...)> : public ServerFunctionBase
{
  static_assert(std::is_same_v<ReturnType, NMX::IResult> || std::is_same_v<ReturnType, bool>);

public:
  using Callable = std::function<ReturnType(Args...)>;

  VServerFunction(const FunctionRecord& record, Callable callable, std::shared_ptr<CallQueue> calls)
      : ServerFunctionBase(record, std::move(calls)), m_callable(std::move(callable))
  {
  }

  [[nodiscard]] std::span<const ArgumentType> Arguments() const override { return argumentTypes<Args...>; }
  [[nodiscard]] bool ReturnsTruth() const override { return std::is_same_v<ReturnType, bool>; }

  void Invoke(std::string_view& argumentText, const NMX::Caller& caller, Completion completion) override
  {
    auto call = std::make_shared<Call>(caller, std::move(completion), m_callable);
    const std::size_t before = argumentText.size();
    ArgumentReader reader(argumentText);
    std::size_t argumentsRead = 0;
    const NMX::IResult parsed = Parse(reader, call->values, argumentsRead, std::index_sequence_for<Args...>{});
    call->SetArgumentBytes(before - argumentText.size());
    Accept(call, parsed, reader, argumentsRead);
  }

private:
  /// The reply and the arguments of one call. Refers to the function's callable; the posted task keeps the function.
  struct Call final : VPendingReply
  {
    Call(const NMX::Caller& caller, Completion completion, const Callable& called)
        : VPendingReply(caller, std::move(completion)), callable(called)
    {
    }

    [[nodiscard]] std::optional<bool> Returned() const override { return returned; }

    void WriteOutputs(IValueWriter& writer) const override { Write(writer, std::index_sequence_for<Args...>{}); }

    void Run() override
    {
      if constexpr (std::is_same_v<ReturnType, bool>)
      {
        returned = std::apply(callable, values);
        SetResult(NMX::EResult::Ok);
      }
      else
        SetResult(std::apply(callable, values));
    }

    template <std::size_t... index>
    void Write(IValueWriter& writer, std::index_sequence<index...>) const
    {
      (WriteOne<index, Args>(writer), ...);
    }

    template <std::size_t index, class Argument>
    void WriteOne(IValueWriter& writer) const
    {
      if constexpr (isOutput<Argument>)
        ValueTraits<std::remove_cvref_t<Argument>>::Write(writer, std::get<index>(values));
    }

    const Callable& callable;
    ArgumentValues<Args...> values{};
    std::optional<bool> returned;
  };

  template <std::size_t... index>
  static NMX::IResult Parse(ArgumentReader& reader, ArgumentValues<Args...>& values, std::size_t& argumentsRead,
                            std::index_sequence<index...>)
  {
    NMX::IResult result = reader.Begin();
    if (result.Failed())
      return result;
    (ParseOne<Args>(reader, std::get<index>(values), argumentsRead, result), ...);
    return result.Failed() ? result : reader.End();
  }

  template <class Argument, class Value>
  static void ParseOne(ArgumentReader& reader, Value& value, std::size_t& argumentsRead, NMX::IResult& result)
  {
    if constexpr (!isOutput<Argument>)
    {
      if (result.Failed())
        return;
      result = ValueTraits<Value>::Read(reader, value);
      if (result.Succeeded())
        ++argumentsRead;
    }
  }

  const Callable m_callable;
};

}
