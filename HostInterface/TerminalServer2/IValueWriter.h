#pragma once

#include <cstdint>
#include <set>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace TerminalServer2
{

/// Receives argument values on their way out; the server gives each type its form on the wire.
class IValueWriter
{
public:
  /// A value of an enumeration and its text.
  using Warning = std::pair<std::uint32_t, std::string_view>;

  virtual void Bool(bool value) = 0;
  virtual void UInt32(std::uint32_t value) = 0;
  virtual void UInt64(std::uint64_t value) = 0;
  virtual void Double(double value) = 0;
  virtual void Text(std::string_view value) = 0;
  virtual void TextSet(const std::set<std::string>& value) = 0;
  virtual void TextList(const std::vector<std::string>& value) = 0;
  virtual void WarningMap(std::span<const Warning> value) = 0;

protected:
  ~IValueWriter() = default;
};

}
