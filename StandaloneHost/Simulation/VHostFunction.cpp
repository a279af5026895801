#include "StandaloneHost/Simulation/VHostFunction.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "HostInterface/NMX/IntegerText.h"

#include <boost/json/stream_parser.hpp>

#include <algorithm>
#include <exception>
#include <limits>
#include <utility>

namespace Simulation
{

using NMX::EResult;
using NMX::IResult;
using TerminalServer2::ArgumentType;
using TerminalServer2::EArgumentType;
using TerminalServer2::EDirection;

namespace
{

ArgumentValue EmptyValue(EArgumentType type)
{
  if (type == EArgumentType::Bool)
    return false;
  if (type == EArgumentType::UInt32)
    return std::uint32_t{0};
  if (type == EArgumentType::TextSet)
    return std::set<std::string>{};
  return std::string{};
}

std::string_view Expected(const ArgumentValue& value)
{
  if (std::holds_alternative<bool>(value))
    return "true or false";
  if (std::holds_alternative<std::uint32_t>(value))
    return "a whole number from 0 to 4294967295";
  return "a text";
}

/// `token` is the value's text: however an integer is written, it is the same number.
EResult ToInteger(const boost::json::value& json, std::string_view token, std::uint32_t& integer)
{
  if (!json.is_number())
    return EResult::InvalidFormat;
  const auto number = NMX::IntegerFromJsonNumber(token);
  if (!number || *number > std::numeric_limits<std::uint32_t>::max())
    return EResult::InvalidValue;
  integer = static_cast<std::uint32_t>(*number);
  return EResult::Ok;
}

/// The JSON value in the type that `value` has.
EResult Convert(const boost::json::value& json, std::string_view token, ArgumentValue& value)
{
  if (auto* number = std::get_if<std::uint32_t>(&value))
    return ToInteger(json, token, *number);
  if (auto* flag = std::get_if<bool>(&value); flag != nullptr && json.is_bool())
    *flag = json.get_bool();
  else if (auto* text = std::get_if<std::string>(&value); text != nullptr && json.is_string())
    text->assign(json.get_string().data(), json.get_string().size());
  else
    return EResult::InvalidFormat;
  return EResult::Ok;
}

EResult ReadCharacter(std::string_view& text, char expected)
{
  text.remove_prefix(std::min(text.find_first_not_of(" \t\r\n"), text.size()));
  if (text.empty())
    return EResult::EndOfData;
  if (text.front() != expected)
    return EResult::InvalidFormat;
  text.remove_prefix(1);
  return EResult::Ok;
}

EResult ReadValue(std::string_view& text, ArgumentValue& value)
{
  boost::json::stream_parser parser;
  boost::json::error_code error;
  const std::size_t read = parser.write_some(text.data(), text.size(), error);
  if (!error && !parser.done())
    parser.finish(error);
  if (error == boost::json::error::incomplete)
    return EResult::EndOfData;
  if (error)
    return error == boost::json::error::exponent_overflow ? EResult::InvalidValue : EResult::InvalidFormat;
  const EResult converted = Convert(parser.release(), text.substr(0, read), value);
  if (converted == EResult::Ok)
    text.remove_prefix(read);
  return converted;
}

}

/// One call with what it has come to so far. Whoever finishes it must hold it alone.
class VHostFunction::Call final : public NMX::IServerReply
{
public:
  explicit Call(Completion completion) : m_completion(std::move(completion)) {}

  [[nodiscard]] IResult Result() const override { return result; }
  [[nodiscard]] std::string_view Text() const override { return text; }
  [[nodiscard]] std::optional<bool> Returned() const override { return std::nullopt; }

  void WriteOutputs(TerminalServer2::IValueWriter& writer) const override
  {
    struct Write
    {
      void operator()(bool value) const { to.Bool(value); }
      void operator()(std::uint32_t value) const { to.UInt32(value); }
      void operator()(const std::string& value) const { to.Text(value); }
      void operator()(const std::set<std::string>& value) const { to.TextSet(value); }
      TerminalServer2::IValueWriter& to;
    };
    for (const ArgumentValue& output : outputs)
      std::visit(Write{writer}, output);
  }

  void Finish()
  {
    const auto completion = std::exchange(m_completion, nullptr);
    try
    {
      if (completion)
        completion(*this);
    }
    catch (...)
    {
      NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "The server failed to take a reply.");
    }
  }

  void Refuse(EResult code, std::string complaint)
  {
    result = code;
    text = std::move(complaint);
  }

  IResult result = EResult::NoResult;
  std::string text;
  ArgumentValues inputs;
  ArgumentValues outputs;

private:
  Completion m_completion;
};

VHostFunction::VHostFunction(const TerminalServer2::FunctionRecord& record,
                             std::span<const TerminalServer2::ArgumentType> arguments, Operation operation,
                             std::shared_ptr<NMX::IPostalService> postal)
    : m_record(record), m_arguments(arguments), m_operation(std::move(operation)), m_postal(std::move(postal))
{
}

void VHostFunction::Invoke(std::string_view& argumentText, const NMX::Caller& /*caller*/, Completion completion)
{
  const auto call = std::make_shared<Call>(std::move(completion));
  try
  {
    call->outputs = EmptyValues(EDirection::Output);
    call->inputs = EmptyValues(EDirection::Input);
    Read(argumentText, *call);
    if (call->text.empty())
    {
      Post(call);
      return;
    }
  }
  catch (...)
  {
    NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "%1%: the call could not be posted.", m_record.name);
  }
  call->Finish();
}

void VHostFunction::Read(std::string_view& argumentText, Call& call) const
{
  if (const EResult begun = ReadCharacter(argumentText, '['); begun != EResult::Ok)
    return call.Refuse(begun, "expected an array of arguments");
  const std::size_t count = call.inputs.size();
  for (std::size_t i = 0; i < count; ++i)
  {
    ArgumentValue& input = call.inputs[i];
    EResult read = i == 0 ? EResult::Ok : ReadCharacter(argumentText, ',');
    if (read == EResult::Ok)
      read = ReadValue(argumentText, input);
    if (read != EResult::Ok)
      return call.Refuse(read, "argument " + std::to_string(i + 1) + " \"" + std::string(InputName(i)) +
                                   "\": expected " + std::string(Expected(input)));
  }
  if (const EResult ended = ReadCharacter(argumentText, ']'); ended != EResult::Ok)
    call.Refuse(ended, "after " + std::to_string(count) + " argument" + (count == 1 ? "" : "s") +
                           ": expected no further argument");
}

void VHostFunction::Post(const std::shared_ptr<Call>& call)
{
  // The call is in the set before its task can run, because the task needs the same mutex.
  const std::lock_guard lock(m_mutex);
  const auto place = m_outstanding.insert(call).first;
  try
  {
    m_postal->Post([self = SharedSelf(*this), call] { self->RunPosted(call); });
  }
  catch (...)
  {
    m_outstanding.erase(place);
    throw;
  }
}

void VHostFunction::RunPosted(const std::shared_ptr<Call>& call)
{
  {
    const std::lock_guard lock(m_mutex);
    if (m_outstanding.erase(call) == 0)
      return;
  }
  try
  {
    call->result = m_operation(call->inputs, call->outputs);
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "%1%: %2%", m_record.name, failure.what());
  }
  catch (...)
  {
    NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "%1%: an unknown exception", m_record.name);
  }
  call->Finish();
}

void VHostFunction::FinishOutstanding(IResult result)
{
  std::unordered_set<std::shared_ptr<Call>> taken;
  {
    const std::lock_guard lock(m_mutex);
    taken.swap(m_outstanding);
  }
  for (const auto& call : taken)
  {
    call->result = result;
    call->Finish();
  }
}

ArgumentValues VHostFunction::EmptyValues(EDirection direction) const
{
  ArgumentValues values;
  for (const ArgumentType& argument : m_arguments)
    if (argument.direction == direction)
      values.push_back(EmptyValue(argument.type));
  return values;
}

std::string_view VHostFunction::InputName(std::size_t input) const
{
  for (std::size_t i = 0; i < m_arguments.size(); ++i)
    if (m_arguments[i].direction == EDirection::Input && input-- == 0)
      return m_record.arguments[i].name;
  return {};
}

}
