#pragma once

#include "HostInterface/TerminalServer2/IValueWriter.h"

#include <span>
#include <string>
#include <string_view>

namespace Server
{

/// Appends a JSON string. The text is UTF-8; control characters, quotes and backslashes are escaped.
void AppendString(std::string& json, std::string_view text);

void AppendNumber(std::string& json, std::uint64_t number);
void AppendNumber(std::string& json, std::int64_t number);

/// Appends the shortest text that reads back as the same number; the nearest finite number for one that is not.
void AppendNumber(std::string& json, double number);

/// Writes argument values as the members of a JSON object, each under the next of the given names.
class MemberWriter final : public TerminalServer2::IValueWriter
{
public:
  MemberWriter(std::string& json, std::span<const std::string_view> names) : m_json(json), m_names(names) {}

  void Bool(bool value) override;
  void UInt32(std::uint32_t value) override;
  void UInt64(std::uint64_t value) override;
  void Double(double value) override;
  void Text(std::string_view value) override;
  void TextSet(const std::set<std::string>& value) override;
  void TextList(const std::vector<std::string>& value) override;
  void WarningMap(std::span<const Warning> value) override;

private:
  void Name();

  template <class Range, class Append>
  void Array(const Range& range, Append append);

  std::string& m_json;
  std::span<const std::string_view> m_names;
  std::size_t m_next = 0;
};

}
