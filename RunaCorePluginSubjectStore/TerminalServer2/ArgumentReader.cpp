#include "RunaCorePluginSubjectStore/TerminalServer2/ArgumentReader.h"

#include <boost/json/monotonic_resource.hpp>
#include <boost/json/static_resource.hpp>
#include <boost/json/stream_parser.hpp>

#include <charconv>
#include <cmath>
#include <limits>

namespace TerminalServer2
{

using NMX::EResult;
using NMX::IResult;

namespace
{

constexpr std::size_t maximumDepth = 32;

/// The greatest whole number up to which a double is exact.
constexpr double exactDouble = 9007199254740992.0;

void SkipWhiteSpace(std::string_view& text)
{
  const auto isWhiteSpace = [](char c) { return c == ' ' || c == '\t' || c == '\n' || c == '\r'; };
  while (!text.empty() && isWhiteSpace(text.front()))
    text.remove_prefix(1);
}

/// A whole number, however it is written: 7, 7.0 and 70e-1 are the same number.
bool WholeNumber(const boost::json::value& json, std::uint64_t& number)
{
  if (const auto* unsignedNumber = json.if_uint64())
  {
    number = *unsignedNumber;
    return true;
  }
  if (const auto* signedNumber = json.if_int64(); signedNumber != nullptr && *signedNumber >= 0)
  {
    number = static_cast<std::uint64_t>(*signedNumber);
    return true;
  }
  if (const auto* real = json.if_double();
      real != nullptr && *real >= 0 && *real <= exactDouble && std::trunc(*real) == *real)
  {
    number = static_cast<std::uint64_t>(*real);
    return true;
  }
  return false;
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

IResult ArgumentReader::UInt64(std::uint64_t& value)
{
  return Next("a whole number from 0 to 18446744073709551615",
              [&](const boost::json::value& json, std::string_view /*token*/)
              {
                if (!json.is_number())
                  return EResult::InvalidFormat;
                return WholeNumber(json, value) ? EResult::Ok : EResult::InvalidValue;
              });
}

IResult ArgumentReader::UInt32(std::uint32_t& value)
{
  return Next("a whole number from 0 to 4294967295",
              [&](const boost::json::value& json, std::string_view /*token*/)
              {
                if (!json.is_number())
                  return EResult::InvalidFormat;
                std::uint64_t number = 0;
                if (!WholeNumber(json, number) || number > std::numeric_limits<std::uint32_t>::max())
                  return EResult::InvalidValue;
                value = static_cast<std::uint32_t>(number);
                return EResult::Ok;
              });
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
