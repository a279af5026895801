#include "StandaloneHost/Store/RecordText.h"

#include "StoreInterface/WideText.h"

#include <boost/json.hpp>

#include <array>
#include <charconv>
#include <stdexcept>
#include <string_view>
#include <utility>

namespace Store
{

namespace json = boost::json;
using NMX::EValueType;
using NMX::Value;

namespace
{

json::value IdToJson(NMX::TSubjectStoreId id)
{
  return std::uint64_t{id.Value()};
}

NMX::TSubjectStoreId IdFromJson(const json::value& value)
{
  return NMX::TSubjectStoreId(value.to_number<std::uint64_t>());
}

/// As a text: the reader of JSON may take a number for the one next to it.
json::value DoubleToJson(double value)
{
  std::array<char, 32> text;
  const auto written = std::to_chars(text.data(), text.data() + text.size(), value);
  return json::value(std::string_view(text.data(), static_cast<std::size_t>(written.ptr - text.data())));
}

/// A number is what version 1 of the format has.
double DoubleFromJson(const json::value& value)
{
  if (value.is_number())
    return value.to_number<double>();
  const json::string& text = value.as_string();
  double number = 0;
  const auto read = std::from_chars(text.data(), text.data() + text.size(), number);
  if (read.ec != std::errc{} || read.ptr != text.data() + text.size())
    throw std::runtime_error("a number that cannot be read");
  return number;
}

json::value WideToJson(const std::wstring& text)
{
  // What cannot be written as UTF-8 cannot have come in either.
  return json::value(NMX::ToUtf8(text).value_or(std::string{}));
}

std::wstring WideFromJson(const json::value& value)
{
  return NMX::ToWide(value.as_string()).value_or(std::wstring{});
}

std::string TextFromJson(const json::value& value)
{
  return std::string(value.as_string());
}

template <class Element, class Convert>
json::value ListToJson(const std::vector<Element>& list, Convert convert)
{
  json::array array;
  array.reserve(list.size());
  for (const Element& element : list)
    array.push_back(convert(element));
  return array;
}

template <class Element, class Convert>
std::vector<Element> ListFromJson(const json::value& value, Convert convert)
{
  std::vector<Element> list;
  list.reserve(value.as_array().size());
  for (const json::value& element : value.as_array())
    list.push_back(convert(element));
  return list;
}

/// The form of each type; the type itself is not part of it.
struct ToJson
{
  json::value operator()(std::monostate) const { return nullptr; }
  json::value operator()(bool value) const { return value; }
  json::value operator()(std::int32_t value) const { return value; }
  json::value operator()(std::uint32_t value) const { return value; }
  json::value operator()(std::uint64_t value) const { return value; }
  json::value operator()(double value) const { return DoubleToJson(value); }
  json::value operator()(const std::string& value) const { return json::value(value); }
  json::value operator()(const std::wstring& value) const { return WideToJson(value); }
  json::value operator()(const NMX::Colour& value) const
  {
    return json::array{value.red, value.green, value.blue, value.alpha};
  }
  json::value operator()(NMX::TSubjectStoreId value) const { return IdToJson(value); }
  json::value operator()(const std::vector<NMX::TSubjectStoreId>& value) const { return ListToJson(value, IdToJson); }
  json::value operator()(const std::vector<NMX::Position>& value) const
  {
    return ListToJson(value, [](const NMX::Position& p) -> json::value
                      { return json::array{DoubleToJson(p.x), DoubleToJson(p.y), DoubleToJson(p.z)}; });
  }
  json::value operator()(const std::vector<NMX::SmartCluster>& value) const
  {
    return ListToJson(value, [](const NMX::SmartCluster& cluster) -> json::value
                      { return json::array{cluster.label, cluster.deviceUrn, cluster.pattern, cluster.type}; });
  }
  json::value operator()(const std::vector<NMX::Slot>& value) const
  {
    return ListToJson(value,
                      [](const NMX::Slot& slot) -> json::value { return json::array{IdToJson(slot.id), slot.name}; });
  }
  json::value operator()(const NMX::Option& value) const
  {
    return json::array{WideToJson(value.chosen),
                       ListToJson(value.choices, [](const NMX::Choice& choice) -> json::value
                                  { return json::array{choice.name, WideToJson(choice.path)}; })};
  }
  json::value operator()(const NMX::Action& value) const { return json::array{value.state, value.text}; }
};

Value FromJson(EValueType type, const json::value& value)
{
  if (value.is_null())
    return {};
  switch (type)
  {
  case EValueType::Nothing:
    break;
  case EValueType::Bool:
    return value.as_bool();
  case EValueType::Int32:
    return value.to_number<std::int32_t>();
  case EValueType::UInt32:
    return value.to_number<std::uint32_t>();
  case EValueType::UInt64:
    return value.to_number<std::uint64_t>();
  case EValueType::Double:
    return DoubleFromJson(value);
  case EValueType::Text:
    return TextFromJson(value);
  case EValueType::WideText:
    return WideFromJson(value);
  case EValueType::Colour:
  {
    const auto channel = [&](std::size_t index) { return value.as_array().at(index).to_number<std::uint8_t>(); };
    return NMX::Colour{channel(0), channel(1), channel(2), channel(3)};
  }
  case EValueType::SubjectId:
    return IdFromJson(value);
  case EValueType::SubjectIds:
    return ListFromJson<NMX::TSubjectStoreId>(value, IdFromJson);
  case EValueType::Positions:
    return ListFromJson<NMX::Position>(value,
                                       [](const json::value& p)
                                       {
                                         const auto at = [&](std::size_t index)
                                         { return DoubleFromJson(p.as_array().at(index)); };
                                         return NMX::Position{at(0), at(1), at(2)};
                                       });
  case EValueType::SmartClusters:
    return ListFromJson<NMX::SmartCluster>(value,
                                           [](const json::value& cluster)
                                           {
                                             const json::array& parts = cluster.as_array();
                                             return NMX::SmartCluster{
                                                 TextFromJson(parts.at(0)), TextFromJson(parts.at(1)),
                                                 parts.at(2).to_number<std::uint32_t>(), TextFromJson(parts.at(3))};
                                           });
  case EValueType::Slots:
    return ListFromJson<NMX::Slot>(
        value, [](const json::value& slot)
        { return NMX::Slot{IdFromJson(slot.as_array().at(0)), TextFromJson(slot.as_array().at(1))}; });
  case EValueType::Option:
    return NMX::Option{
        WideFromJson(value.as_array().at(0)),
        ListFromJson<NMX::Choice>(
            value.as_array().at(1), [](const json::value& choice)
            { return NMX::Choice{TextFromJson(choice.as_array().at(0)), WideFromJson(choice.as_array().at(1))}; })};
  case EValueType::Action:
    return NMX::Action{value.as_array().at(0).to_number<std::uint32_t>(), TextFromJson(value.as_array().at(1))};
  }
  throw std::runtime_error("a value of an unknown type");
}

[[nodiscard]] bool IsKept(const SchemaEntry& entry)
{
  return entry.storage != EStorage::Group && entry.writer == EWriter::Anyone;
}

}

std::string RecordToText(const SubjectRecord& record)
{
  json::object object;
  for (const SchemaEntry& entry : KindSchema::Of(record.kind).Entries())
  {
    if (!IsKept(entry))
      continue;
    const Value& value = record.Get(entry);
    if (value != entry.initial)
      object.emplace(entry.path.Text(), std::visit(ToJson{}, value));
  }
  return json::serialize(object);
}

std::unique_ptr<SubjectRecord> RecordFromText(NMX::TSubjectStoreId id, NMX::ESubjectKind kind, std::string name,
                                              std::string_view text)
{
  auto record = std::make_unique<SubjectRecord>(id, kind, std::move(name));
  const json::value parsed = json::parse(text);
  const KindSchema& schema = KindSchema::Of(kind);
  for (const SchemaEntry& entry : schema.Entries())
    if (IsKept(entry))
      if (const json::value* value = parsed.as_object().if_contains(entry.path.Text()))
      {
        if (value->is_null() && entry.storage == EStorage::Bit)
          throw std::runtime_error("no truth value for " + std::string(entry.path.Text()));
        record->Set(entry, FromJson(entry.type, *value));
      }
  return record;
}

std::string ValueToText(const Value& value)
{
  return json::serialize(json::array{static_cast<unsigned>(TypeOf(value)), std::visit(ToJson{}, value)});
}

Value ValueFromText(std::string_view text)
{
  const json::value parsed = json::parse(text);
  const auto type = parsed.as_array().at(0).to_number<std::uint8_t>();
  if (type >= std::variant_size_v<Value>)
    throw std::runtime_error("a value of an unknown type");
  return FromJson(static_cast<EValueType>(type), parsed.as_array().at(1));
}

}
