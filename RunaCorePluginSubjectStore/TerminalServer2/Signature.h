#pragma once

#include "RunaCorePluginSubjectStore/TerminalServer2/ValueTraits.h"

#include <array>
#include <tuple>
#include <type_traits>

namespace TerminalServer2
{

/// An argument taken by non-constant reference is an output, every other one an input.
template <class Argument>
inline constexpr bool isOutput =
    std::is_lvalue_reference_v<Argument> && !std::is_const_v<std::remove_reference_t<Argument>>;

template <class Argument>
inline constexpr ArgumentType argumentType{ValueTraits<std::remove_cvref_t<Argument>>::type,
                                           isOutput<Argument> ? EDirection::Output : EDirection::Input,
                                           ValueTraits<std::remove_cvref_t<Argument>>::enumeration};

template <class... Arguments>
inline constexpr std::array<ArgumentType, sizeof...(Arguments)> argumentTypes{argumentType<Arguments>...};

/// The values of all arguments of one call, inputs and outputs.
template <class... Arguments>
using ArgumentValues = std::tuple<std::remove_cvref_t<Arguments>...>;

/// The parts of a member function's type.
template <class Member>
struct Operation;

template <class I, class Result, class... Arguments>
struct Operation<Result (I::*)(Arguments...)>
{
  using Interface = I;
  using Signature = Result(Arguments...);
  static constexpr std::size_t arity = sizeof...(Arguments);
};

template <class I, class Result, class... Arguments>
struct Operation<Result (I::*)(Arguments...) const> : Operation<Result (I::*)(Arguments...)>
{
};

}
