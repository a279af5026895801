#include "RunaCorePluginSubjectStore/TerminalServer2/ArgumentReader.h"

#include "HostInterface/NMX/IntegerText.h"

#include <boost/json/monotonic_resource.hpp>
#include <boost/json/static_resource.hpp>
#include <boost/json/stream_parser.hpp>

#include <charconv>
#include <cmath>
#include <limits>
#include <optional>

namespace TerminalServer2
{

using NMX::EResult;
using NMX::IResult;

namespace
{

constexpr std::size_t maximumDepth = 32;

void SkipWhiteSpace(std::string_view& text)
{
  const auto isWhiteSpace = [](char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; };
  while (!text.empty() && isWhiteSpace(text.front()))
    text.remove_prefix(1);
}

/// The integer that a value is, whose text is `token`: the parser may have taken it for the double next to it.
std::optional<std::uint64_t> IntegerOf(const boost::json::value& json, std::string_view token)
{
  if (const auto* number = json.if_uint64())
    return *number;
  if (const auto* number = json.if_int64(); number != nullptr && *number >= 0)
    return static_cast<std::uint64_t>(*number);
  return json.is_double() ? NMX::IntegerFromJsonNumber(token) : std::nullopt;
}

}

IResult ArgumentReader::Fail(EResult code, std::string_view expected)
{
  m_expected = expected;
  return code;
}

IResult ArgumentReader::Character(char expected, std::string_view name)
{
  SkipWhiteSpace(m_text);
  if (m_text.empty())
    return Fail(EResult::EndOfData, name);
  if (m_text.front() != expected)
    return Fail(EResult::InvalidFormat, name);
  m_text.remove_prefix(1);
  return EResult::Ok;
}

IResult ArgumentReader::Begin()
{
  const IResult bracket = Character('[', "an array of arguments");
  m_begun = bracket.Succeeded();
  return bracket;
}

IResult ArgumentReader::End()
{
  return Character(']', "no further argument");
}

template <class Convert>
IResult ArgumentReader::Next(std::string_view expected, Convert convert)
{
  if (!m_first)
    if (const IResult comma = Character(',', expected); comma.Failed())
      return comma;
  m_first = false;

  SkipWhiteSpace(m_text);
  if (m_text.empty())
    return Fail(EResult::EndOfData, expected);

  // The values lie in the buffer, so nothing is allocated for arguments of ordinary size.
  unsigned char buffer[2048];
  boost::json::monotonic_resource memory(buffer, sizeof buffer);
  boost::json::parse_options options;
  options.max_depth = maximumDepth;
  unsigned char parserBuffer[512];
  boost::json::stream_parser parser(boost::json::storage_ptr{}, options, parserBuffer);
  parser.reset(&memory);

  boost::json::error_code error;
  const std::size_t read = parser.write_some(m_text.data(), m_text.size(), error);
  if (!error && !parser.done())
    parser.finish(error);
  if (error == boost::json::error::incomplete)
  {
    m_text = {};
    return Fail(EResult::EndOfData, expected);
  }
  if (error)
    return Fail(error == boost::json::error::exponent_overflow ? EResult::InvalidValue : EResult::InvalidFormat,
                expected);

  const EResult converted = convert(parser.release(), m_text.substr(0, read));
  if (converted != EResult::Ok)
    return Fail(converted, expected);
  m_text.remove_prefix(read);
  return EResult::Ok;
}

IResult ArgumentReader::Bool(bool& value)
{
  return Next("true or false",
              [&](const boost::json::value& json, std::string_view /*token*/)
              {
                const bool* found = json.if_bool();
                if (found == nullptr)
                  return EResult::InvalidFormat;
                value = *found;
                return EResult::Ok;
              });
}

template <class Number>
IResult ArgumentReader::Integer(std::string_view expected, Number& value)
{
  return Next(expected,
              [&](const boost::json::value& json, std::string_view token)
              {
                if (!json.is_number())
                  return EResult::InvalidFormat;
                const auto number = IntegerOf(json, token);
                if (!number || *number > std::numeric_limits<Number>::max())
                  return EResult::InvalidValue;
                value = static_cast<Number>(*number);
                return EResult::Ok;
              });
}

IResult ArgumentReader::UInt64(std::uint64_t& value)
{
  return Integer("a whole number from 0 to 18446744073709551615", value);
}

IResult ArgumentReader::UInt32(std::uint32_t& value)
{
  return Integer("a whole number from 0 to 4294967295", value);
}

IResult ArgumentReader::Double(double& value)
{
  return Next("a number",
              [&](const boost::json::value& json, std::string_view token)
              {
                if (!json.is_number())
                  return EResult::InvalidFormat;
                // The parser may take a number for the one next to it; only what is too small stays as it has it.
                double number = json.to_number<double>();
                if (!std::isfinite(number))
                  return EResult::InvalidValue;
                (void)std::from_chars(token.data(), token.data() + token.size(), number);
                value = number;
                return EResult::Ok;
              });
}

IResult ArgumentReader::Text(std::string& value)
{
  return Next("a text",
              [&](const boost::json::value& json, std::string_view /*token*/)
              {
                const auto* found = json.if_string();
                if (found == nullptr)
                  return EResult::InvalidFormat;
                value.assign(found->data(), found->size());
                return EResult::Ok;
              });
}

}
