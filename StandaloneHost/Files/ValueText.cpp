#include "StandaloneHost/Files/ValueText.h"

#include "StoreInterface/ColourText.h"
#include "StoreInterface/ValueLimits.h"
#include "StoreInterface/WideText.h"

#include <charconv>
#include <cmath>
#include <iterator>
#include <optional>
#include <system_error>

namespace Files
{

using NMX::EValueType;

namespace
{

using Read = std::optional<NMX::Value>;

Read ReadBool(std::string_view text)
{
  if (text == "true")
    return true;
  if (text == "false")
    return false;
  return std::nullopt;
}

template <class Number>
Read ReadNumber(std::string_view text)
{
  Number number{};
  const char* end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number);
  if (error != std::errc{} || stop != end)
    return std::nullopt;
  return number;
}

Read ReadDouble(std::string_view text)
{
  const Read number = ReadNumber<double>(text);
  return number && std::isfinite(std::get<double>(*number)) ? number : std::nullopt;
}

Read ReadText(std::string_view text)
{
  return std::string(text);
}

Read ReadWideText(std::string_view text)
{
  if (auto wide = NMX::ToWide(text))
    return *std::move(wide);
  return std::nullopt;
}

Read ReadColour(std::string_view text)
{
  NMX::Colour colour;
  if (NMX::ColourFromText(text, colour).Failed())
    return std::nullopt;
  return colour;
}

std::string WriteBool(const NMX::Value& value)
{
  return std::get<bool>(value) ? "true" : "false";
}

/// The shortest text that reads as the same number.
template <class Number>
std::string WriteNumber(const NMX::Value& value)
{
  char text[32];
  const auto [end, error] = std::to_chars(std::begin(text), std::end(text), std::get<Number>(value));
  return {std::begin(text), end};
}

std::string WriteText(const NMX::Value& value)
{
  return std::get<std::string>(value);
}

std::string WriteWideText(const NMX::Value& value)
{
  if (auto text = NMX::ToUtf8(std::get<std::wstring>(value)))
    return *std::move(text);
  throw ConfigurationError("a text is not Unicode, which no file can hold");
}

std::string WriteColour(const NMX::Value& value)
{
  return NMX::ColourToText(std::get<NMX::Colour>(value));
}

/// How a value type is written.
struct Form
{
  EValueType type;
  Read (*read)(std::string_view);
  std::string (*write)(const NMX::Value&);
  std::string_view expected;
};

constexpr Form forms[] = {
    {EValueType::Bool, ReadBool, WriteBool, "true or false"},
    {EValueType::Int32, ReadNumber<std::int32_t>, WriteNumber<std::int32_t>,
     "a whole number from -2147483648 to 2147483647"},
    {EValueType::UInt32, ReadNumber<std::uint32_t>, WriteNumber<std::uint32_t>, "a whole number from 0 to 4294967295"},
    {EValueType::UInt64, ReadNumber<std::uint64_t>, WriteNumber<std::uint64_t>,
     "a whole number from 0 to 18446744073709551615"},
    {EValueType::Double, ReadDouble, WriteNumber<double>, "a finite number"},
    {EValueType::Text, ReadText, WriteText, "a text"},
    {EValueType::WideText, ReadWideText, WriteWideText, "a text"},
    {EValueType::Colour, ReadColour, WriteColour, "#AARRGGBB or #RRGGBB"},
};

const Form* Find(EValueType type)
{
  for (const Form& form : forms)
    if (form.type == type)
      return &form;
  return nullptr;
}

}

bool HasText(EValueType type)
{
  return Find(type) != nullptr;
}

NMX::Value ReadValue(EValueType type, const Place& place, std::string_view what, std::string_view text)
{
  const Form& form = *Find(type);
  Read value = form.read(text);
  if (!value)
    Fail(place, std::string(what) + " is " + Quoted(text) + ", expected " + std::string(form.expected));
  if (const std::string problem = NMX::ValueLimits::Problem(*value); !problem.empty())
    Fail(place, std::string(what) + ' ' + problem);
  return *std::move(value);
}

std::string TextOf(const NMX::Value& value)
{
  return Find(NMX::TypeOf(value))->write(value);
}

}
