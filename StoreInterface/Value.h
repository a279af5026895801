#pragma once

#include "HostInterface/NMX/ITypedId.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace NMX
{

struct Colour
{
  std::uint8_t red = 255;
  std::uint8_t green = 255;
  std::uint8_t blue = 255;
  std::uint8_t alpha = 255;

  friend bool operator==(const Colour&, const Colour&) = default;
};

/// A place in mm.
struct Position
{
  double x = 0;
  double y = 0;
  double z = 0;

  friend bool operator==(const Position&, const Position&) = default;
};

/// One cluster of a smart object: what it is called, the device that carries it (empty: none linked), the pattern its
/// markers blink (0: none), and the device type that it is made for.
struct SmartCluster
{
  std::string label;
  std::string deviceUrn;
  std::uint32_t pattern = 0;
  std::string type;

  friend bool operator==(const SmartCluster&, const SmartCluster&) = default;
};

/// One place of a character that an object can fill.
struct Slot
{
  TSubjectStoreId id;
  std::string name;

  friend bool operator==(const Slot&, const Slot&) = default;
};

/// One of several files to choose from.
struct Choice
{
  std::string name;
  std::wstring path;

  friend bool operator==(const Choice&, const Choice&) = default;
};

/// A setting whose value is the path of one of its choices; empty when none is chosen.
struct Option
{
  std::wstring chosen;
  std::vector<Choice> choices;

  friend bool operator==(const Option&, const Option&) = default;
};

/// Something that can be asked for, unless the state word says that it cannot; the text says why.
struct Action
{
  static constexpr std::uint32_t impossible = 2; ///< a bit of the state word

  std::uint32_t state = 0;
  std::string text;

  friend bool operator==(const Action&, const Action&) = default;
};

/// What a store entry can hold. The first alternative is "no value".
using Value = std::variant<std::monostate, bool, std::int32_t, std::uint32_t, std::uint64_t, double, std::string,
                           std::wstring, Colour, TSubjectStoreId, std::vector<TSubjectStoreId>, std::vector<Position>,
                           std::vector<SmartCluster>, std::vector<Slot>, Option, Action>;

/// The alternatives of Value by name, in their order.
enum class EValueType : std::uint8_t
{
  Nothing,
  Bool,
  Int32,
  UInt32,
  UInt64,
  Double,
  Text,
  WideText,
  Colour,
  SubjectId,
  SubjectIds,
  Positions,
  SmartClusters,
  Slots,
  Option,
  Action
};

[[nodiscard]] inline EValueType TypeOf(const Value& value)
{
  return static_cast<EValueType>(value.index());
}

/// What a value type is called in messages, such as "a truth value".
[[nodiscard]] std::string_view TypeName(EValueType type);

}
