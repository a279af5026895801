#pragma once

#include <cstdint>
#include <span>
#include <string_view>

/// The documentation that an API publishes about itself. All texts are constants of the module that registers them
/// and stay valid for as long as the program runs.
namespace TerminalServer2
{

/// Name and one-line documentation of one argument.
struct ArgumentText
{
  std::string_view name;
  std::string_view text;
};

/// Documentation of one API function or change callback. Types are not part of it: the server learns them from the
/// object that carries the record.
struct FunctionRecord
{
  std::string_view name; ///< group and function joined by a point
  std::string_view description;
  std::span<const ArgumentText> arguments; ///< in the order of the bound signature
  std::string_view results;                ///< lines "Code - Meaning"; may be empty
};

/// One value of a documented enumeration.
struct EnumerationValue
{
  std::string_view name;
  std::uint32_t number;
  std::string_view text;
};

/// Documentation of one group (no values) or enumeration (its values in ascending order).
struct TypeRecord
{
  std::string_view name;
  std::string_view description;
  std::span<const EnumerationValue> values;
};

}
