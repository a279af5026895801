#pragma once

#include "HostInterface/NMX/IPostalService.h"
#include "HostInterface/NMX/IServerFunction.h"
#include "HostInterface/NMX/VShared.h"

#include <cstdint>
#include <memory>
#include <mutex>
#include <set>
#include <string>
#include <unordered_set>
#include <variant>
#include <vector>

namespace Simulation
{

/// A value of an argument: a truth value, an unsigned 32-bit number, a text or a set of texts.
using ArgumentValue = std::variant<bool, std::uint32_t, std::string, std::set<std::string>>;
using ArgumentValues = std::vector<ArgumentValue>;

/// An API function that the host offers itself: a record, the types of its arguments, and what it does. [any]
class VHostFunction : public NMX::IServerFunction, public NMX::VShared
{
public:
  /// What a call does. Both have one value of the right type for each argument of that direction; the outputs start
  /// empty. Runs on the postal service.
  using Operation = std::function<NMX::IResult(const ArgumentValues& inputs, ArgumentValues& outputs)>;

  /// The inputs' types are Bool, UInt32 and Text, the outputs may be TextSet too. The record's texts and the types
  /// are constants.
  VHostFunction(const TerminalServer2::FunctionRecord& record, std::span<const TerminalServer2::ArgumentType> arguments,
                Operation operation, std::shared_ptr<NMX::IPostalService> postal);

  [[nodiscard]] const TerminalServer2::FunctionRecord& Record() const override { return m_record; }
  [[nodiscard]] std::span<const TerminalServer2::ArgumentType> Arguments() const override { return m_arguments; }
  [[nodiscard]] bool ReturnsTruth() const override { return false; }
  void Invoke(std::string_view& argumentText, const NMX::Caller& caller, Completion completion) override;
  void FinishOutstanding(NMX::IResult result) override;

private:
  class Call;

  void Read(std::string_view& argumentText, Call& call) const;
  void Post(const std::shared_ptr<Call>& call);
  void RunPosted(const std::shared_ptr<Call>& call);
  [[nodiscard]] ArgumentValues EmptyValues(TerminalServer2::EDirection direction) const;
  [[nodiscard]] std::string_view InputName(std::size_t input) const;

  const TerminalServer2::FunctionRecord m_record;
  const std::span<const TerminalServer2::ArgumentType> m_arguments;
  const Operation m_operation;
  const std::shared_ptr<NMX::IPostalService> m_postal;
  std::mutex m_mutex;
  std::unordered_set<std::shared_ptr<Call>> m_outstanding; // guarded by m_mutex; who takes a call out finishes it
};

}
