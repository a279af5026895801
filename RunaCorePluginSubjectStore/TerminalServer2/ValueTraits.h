#pragma once

#include "HostInterface/NMX/ITypedId.h"
#include "HostInterface/TerminalServer2/ArgumentType.h"
#include "HostInterface/TerminalServer2/IValueWriter.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/ArgumentReader.h"

#include <concepts>
#include <map>
#include <set>
#include <string>
#include <type_traits>
#include <vector>

namespace TerminalServer2
{

/// What the binding knows of a type that arguments may have: its published type, how an input is read, how an output
/// is written. A new argument type is one more specialisation; one that is only an output needs no Read.
template <class T>
struct ValueTraits;

/// An enumeration of the API: its documentation is found beside it as `DocumentedType(E)`.
template <class E>
concept DocumentedEnumeration = std::is_enum_v<E> && requires(E value) {
  { DocumentedType(value) } -> std::convertible_to<const TypeRecord&>;
};

template <>
struct ValueTraits<bool>
{
  static constexpr EArgumentType type = EArgumentType::Bool;
  static constexpr const TypeRecord* enumeration = nullptr;
  static NMX::IResult Read(ArgumentReader& reader, bool& value) { return reader.Bool(value); }
  static void Write(IValueWriter& writer, bool value) { writer.Bool(value); }
};

template <>
struct ValueTraits<std::uint32_t>
{
  static constexpr EArgumentType type = EArgumentType::UInt32;
  static constexpr const TypeRecord* enumeration = nullptr;
  static NMX::IResult Read(ArgumentReader& reader, std::uint32_t& value) { return reader.UInt32(value); }
  static void Write(IValueWriter& writer, std::uint32_t value) { writer.UInt32(value); }
};

template <>
struct ValueTraits<std::uint64_t>
{
  static constexpr EArgumentType type = EArgumentType::UInt64;
  static constexpr const TypeRecord* enumeration = nullptr;
  static NMX::IResult Read(ArgumentReader& reader, std::uint64_t& value) { return reader.UInt64(value); }
  static void Write(IValueWriter& writer, std::uint64_t value) { writer.UInt64(value); }
};

template <>
struct ValueTraits<double>
{
  static constexpr EArgumentType type = EArgumentType::Double;
  static constexpr const TypeRecord* enumeration = nullptr;
  static NMX::IResult Read(ArgumentReader& reader, double& value) { return reader.Double(value); }
  static void Write(IValueWriter& writer, double value) { writer.Double(value); }
};

template <>
struct ValueTraits<std::string>
{
  static constexpr EArgumentType type = EArgumentType::Text;
  static constexpr const TypeRecord* enumeration = nullptr;
  static NMX::IResult Read(ArgumentReader& reader, std::string& value) { return reader.Text(value); }
  static void Write(IValueWriter& writer, const std::string& value) { writer.Text(value); }
};

template <>
struct ValueTraits<std::set<std::string>>
{
  static constexpr EArgumentType type = EArgumentType::TextSet;
  static constexpr const TypeRecord* enumeration = nullptr;
  static void Write(IValueWriter& writer, const std::set<std::string>& value) { writer.TextSet(value); }
};

template <>
struct ValueTraits<std::vector<std::string>>
{
  static constexpr EArgumentType type = EArgumentType::TextList;
  static constexpr const TypeRecord* enumeration = nullptr;
  static void Write(IValueWriter& writer, const std::vector<std::string>& value) { writer.TextList(value); }
};

template <DocumentedEnumeration E>
struct ValueTraits<std::map<E, std::string>>
{
  static constexpr EArgumentType type = EArgumentType::WarningMap;
  static constexpr const TypeRecord* enumeration = &DocumentedType(E{});
  static void Write(IValueWriter& writer, const std::map<E, std::string>& value)
  {
    std::vector<IValueWriter::Warning> warnings;
    warnings.reserve(value.size());
    for (const auto& [warning, text] : value)
      warnings.emplace_back(static_cast<std::uint32_t>(warning), text);
    writer.WarningMap(warnings);
  }
};

template <DocumentedEnumeration E>
struct ValueTraits<E>
{
  static constexpr EArgumentType type = EArgumentType::Enumeration;
  static constexpr const TypeRecord* enumeration = &DocumentedType(E{});
  static void Write(IValueWriter& writer, E value) { writer.UInt32(static_cast<std::uint32_t>(value)); }
};

template <>
struct ValueTraits<NMX::TCalibrationSessionId>
{
  static constexpr EArgumentType type = EArgumentType::SessionId;
  static constexpr const TypeRecord* enumeration = nullptr;
  static NMX::IResult Read(ArgumentReader& reader, NMX::TCalibrationSessionId& value)
  {
    std::uint32_t number = 0;
    const NMX::IResult read = reader.UInt32(number);
    value = NMX::TCalibrationSessionId(number);
    return read;
  }
  static void Write(IValueWriter& writer, NMX::TCalibrationSessionId value) { writer.UInt32(value.Value()); }
};

}
