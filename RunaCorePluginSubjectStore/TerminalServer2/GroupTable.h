#pragma once

#include "HostInterface/TerminalServer2/IServer.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VServerCallback.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VServerFunction.h"

#include <array>
#include <memory>
#include <span>
#include <string_view>

/// The shape of an API group's table: one row for each function and callback, in registration order, that carries its
/// documentation and what it is bound to. A row whose argument texts do not fit the bound operation does not compile.
namespace TerminalServer2
{

/// The rule that gives a row its level.
enum class ELevel
{
  Open,              ///< open to everyone
  AutoAssign,        ///< open when the host has switched on object auto-assign
  Grouping,          ///< open when the host has switched on proximity grouping
  ObjectEvaluation,  ///< open when the host has switched on object evaluation
  SubjectCalibration ///< open when the host grants it
};

/// What decides about levels.
struct Grants
{
  std::uint32_t featureMask = 0;
  bool subjectCalibration = false;
};

/// The level that a rule comes to.
[[nodiscard]] Level LevelFor(ELevel rule, const Grants& grants);

inline constexpr std::size_t maximumArguments = 4;

/// The documentation part of a row, in a form that can be a constant.
struct RowText
{
  std::string_view name;
  std::string_view description;
  std::array<ArgumentText, maximumArguments> arguments;
  std::size_t argumentCount;
  std::string_view results;

  [[nodiscard]] constexpr FunctionRecord Record() const
  {
    return {name, description, std::span(arguments).first(argumentCount), results};
  }
};

template <class Interface>
struct FunctionRow
{
  RowText text;
  ELevel level;
  std::shared_ptr<NMX::IServerFunction> (*bind)(const FunctionRecord&, const std::shared_ptr<Interface>&,
                                                const std::shared_ptr<CallQueue>&);
};

template <class Interface>
struct CallbackRow
{
  RowText text;
  ELevel level;
  std::shared_ptr<NMX::IServerCallback> (*bind)(const FunctionRecord&, const std::shared_ptr<Interface>&,
                                                const std::shared_ptr<NMX::IPostalService>&);
};

template <class Interface>
struct GroupTable
{
  TypeRecord group;
  std::span<const TypeRecord* const> types;
  ELevel typeLevel;
  std::span<const FunctionRow<Interface>> functions;
  std::span<const CallbackRow<Interface>> callbacks;
};

namespace Detail
{

template <auto member, class Interface, class Signature>
struct Binder;

template <auto member, class Interface, class Result, class... Arguments>
struct Binder<member, Interface, Result(Arguments...)>
{
  static std::shared_ptr<NMX::IServerFunction> Bind(const FunctionRecord& record,
                                                    const std::shared_ptr<Interface>& service,
                                                    const std::shared_ptr<CallQueue>& calls)
  {
    return NMX::MakeShared<VServerFunction<Result(Arguments...)>>(
        record, [service](Arguments... arguments)
        { return ((*service).*member)(std::forward<Arguments>(arguments)...); }, calls);
  }
};

/// The signature of the multi-callback that an accessor returns.
template <class MultiCallback>
struct CallbackSignature;

template <class... Arguments>
struct CallbackSignature<std::shared_ptr<NMX::IMultiCallbackPostal<void(Arguments...)>>>
{
  using Signature = void(Arguments...);
  static constexpr std::size_t arity = sizeof...(Arguments);
};

template <class Interface, class MultiCallback>
auto AccessorResult(std::shared_ptr<MultiCallback> (Interface::*)()) -> std::shared_ptr<MultiCallback>;
template <class Interface, class MultiCallback>
auto AccessorInterface(std::shared_ptr<MultiCallback> (Interface::*)()) -> Interface;

template <std::size_t count>
consteval std::array<ArgumentText, maximumArguments> Texts(const ArgumentText (&arguments)[count])
{
  static_assert(count <= maximumArguments);
  std::array<ArgumentText, maximumArguments> texts{};
  for (std::size_t i = 0; i < count; ++i)
    texts[i] = arguments[i];
  return texts;
}

/// Result texts begin with what success means, and every function stands in a group.
consteval void CheckTexts(std::string_view name, std::string_view results)
{
  if (name.find('.') == std::string_view::npos)
    throw "the name needs its group";
  if (!results.empty() && !results.starts_with("Ok - ") && !results.starts_with("True - "))
    throw "the result documentation begins with success";
}

template <auto member>
consteval auto MakeFunction(const RowText& text, ELevel level)
{
  using O = Operation<decltype(member)>;
  CheckTexts(text.name, text.results);
  return FunctionRow<typename O::Interface>{text, level,
                                            &Binder<member, typename O::Interface, typename O::Signature>::Bind};
}

template <auto accessor>
consteval auto MakeCallback(const RowText& text, ELevel level)
{
  using MultiCallback = decltype(AccessorResult(accessor));
  using Interface = decltype(AccessorInterface(accessor));
  using Signature = typename CallbackSignature<MultiCallback>::Signature;
  CheckTexts(text.name, text.results);
  return CallbackRow<Interface>{
      text, level,
      [](const FunctionRecord& record, const std::shared_ptr<Interface>& service,
         const std::shared_ptr<NMX::IPostalService>& strand) -> std::shared_ptr<NMX::IServerCallback>
      {
        return NMX::MakeShared<VServerCallback<Signature, NMX::IMultiCallbackPostal<Signature>>>(
            record, ((*service).*accessor)(), strand);
      }};
}

}

/// A row for the operation `member` with its name, description, the name and text of each argument, and result texts.
template <auto member, std::size_t count>
consteval auto Function(std::string_view name, std::string_view description, const ArgumentText (&arguments)[count],
                        std::string_view results, ELevel level = ELevel::Open)
{
  static_assert(count == Operation<decltype(member)>::arity, "every argument of the bound operation needs its text");
  return Detail::MakeFunction<member>({name, description, Detail::Texts(arguments), count, results}, level);
}

/// A row for an operation without arguments.
template <auto member>
consteval auto Function(std::string_view name, std::string_view description, std::string_view results,
                        ELevel level = ELevel::Open)
{
  static_assert(Operation<decltype(member)>::arity == 0, "every argument of the bound operation needs its text");
  return Detail::MakeFunction<member>({name, description, {}, 0, results}, level);
}

/// A row for the multi-callback that `accessor` returns.
template <auto accessor, std::size_t count>
consteval auto Callback(std::string_view name, std::string_view description, const ArgumentText (&arguments)[count],
                        ELevel level = ELevel::Open)
{
  static_assert(count == Detail::CallbackSignature<decltype(Detail::AccessorResult(accessor))>::arity,
                "every argument of the callback needs its text");
  return Detail::MakeCallback<accessor>({name, description, Detail::Texts(arguments), count, {}}, level);
}

/// A row for a callback without arguments.
template <auto accessor>
consteval auto Callback(std::string_view name, std::string_view description, ELevel level = ELevel::Open)
{
  static_assert(Detail::CallbackSignature<decltype(Detail::AccessorResult(accessor))>::arity == 0,
                "every argument of the callback needs its text");
  return Detail::MakeCallback<accessor>({name, description, {}, 0, {}}, level);
}

/// Publishes a group: its types, its functions, then its callbacks. A registration that the server refuses leaves out
/// that one row.
template <class Interface>
void RegisterGroup(IServer& server, const GroupTable<Interface>& table, const std::shared_ptr<Interface>& service,
                   const std::shared_ptr<NMX::IPostalService>& strand, const Grants& grants)
{
  const Level typeLevel = LevelFor(table.typeLevel, grants);
  const auto calls = std::make_shared<CallQueue>(strand);
  (void)server.RegisterType(typeLevel, table.group);
  for (const TypeRecord* type : table.types)
    (void)server.RegisterType(typeLevel, *type);
  for (const auto& row : table.functions)
    (void)server.RegisterFunction(LevelFor(row.level, grants), row.bind(row.text.Record(), service, calls));
  for (const auto& row : table.callbacks)
    (void)server.RegisterCallback(LevelFor(row.level, grants), row.bind(row.text.Record(), service, strand));
}

}
