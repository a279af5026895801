#include "StandaloneHost/Server/JsonText.h"

#include <charconv>
#include <cmath>
#include <limits>

namespace Server
{

namespace
{

template <class Number>
void AppendCharacters(std::string& json, Number number)
{
  char buffer[40];
  const auto written = std::to_chars(buffer, buffer + sizeof buffer, number);
  json.append(buffer, written.ptr);
}

bool NeedsEscape(char c)
{
  return static_cast<unsigned char>(c) < 0x20 || c == '"' || c == '\\';
}

void AppendEscaped(std::string& json, char c)
{
  static constexpr std::string_view digits = "0123456789abcdef";
  switch (c)
  {
  case '"':
  case '\\':
    json += '\\';
    json += c;
    break;
  case '\n':
    json += "\\n";
    break;
  case '\t':
    json += "\\t";
    break;
  case '\r':
    json += "\\r";
    break;
  default:
    json += "\\u00";
    json += digits[static_cast<unsigned char>(c) >> 4];
    json += digits[static_cast<unsigned char>(c) & 0xF];
  }
}

}

void AppendString(std::string& json, std::string_view text)
{
  json += '"';
  while (!text.empty())
  {
    std::size_t plain = 0;
    while (plain < text.size() && !NeedsEscape(text[plain]))
      ++plain;
    json.append(text.data(), plain);
    if (plain == text.size())
      break;
    AppendEscaped(json, text[plain]);
    text.remove_prefix(plain + 1);
  }
  json += '"';
}

void AppendNumber(std::string& json, std::uint64_t number)
{
  AppendCharacters(json, number);
}

void AppendNumber(std::string& json, std::int64_t number)
{
  AppendCharacters(json, number);
}

void AppendNumber(std::string& json, double number)
{
  if (!std::isfinite(number))
    number = std::signbit(number) ? std::numeric_limits<double>::lowest() : std::numeric_limits<double>::max();
  AppendCharacters(json, number);
}

void MemberWriter::Name()
{
  if (m_next != 0)
    m_json += ',';
  AppendString(m_json, m_names[m_next++]);
  m_json += ':';
}

template <class Range, class Append>
void MemberWriter::Array(const Range& range, Append append)
{
  Name();
  m_json += '[';
  bool first = true;
  for (const auto& element : range)
  {
    if (!first)
      m_json += ',';
    first = false;
    append(element);
  }
  m_json += ']';
}

void MemberWriter::Bool(bool value)
{
  Name();
  m_json += value ? "true" : "false";
}

void MemberWriter::UInt32(std::uint32_t value)
{
  UInt64(value);
}

void MemberWriter::UInt64(std::uint64_t value)
{
  Name();
  AppendNumber(m_json, value);
}

void MemberWriter::Double(double value)
{
  Name();
  AppendNumber(m_json, value);
}

void MemberWriter::Text(std::string_view value)
{
  Name();
  AppendString(m_json, value);
}

void MemberWriter::TextSet(const std::set<std::string>& value)
{
  Array(value, [this](const std::string& text) { AppendString(m_json, text); });
}

void MemberWriter::TextList(const std::vector<std::string>& value)
{
  Array(value, [this](const std::string& text) { AppendString(m_json, text); });
}

void MemberWriter::WarningMap(std::span<const Warning> value)
{
  Array(value,
        [this](const Warning& warning)
        {
          m_json += '[';
          AppendNumber(m_json, std::uint64_t{warning.first});
          m_json += ',';
          AppendString(m_json, warning.second);
          m_json += ']';
        });
}

}
