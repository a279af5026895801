#pragma once

#include "HostInterface/NMX/IResult.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace TerminalServer2
{

/// Reads the inputs of a call from a JSON array at the front of a request text, one after the other, and steps past
/// what it has read. `EndOfData` when the text ends too early, `InvalidFormat` for the wrong shape or type,
/// `InvalidValue` for a number outside its type's range.
class ArgumentReader
{
public:
  explicit ArgumentReader(std::string_view& text) : m_text(text) {}

  /// The opening and the closing bracket.
  NMX::IResult Begin();
  NMX::IResult End();

  /// The next argument, after a comma when it is not the first.
  NMX::IResult Bool(bool& value);
  NMX::IResult UInt32(std::uint32_t& value);
  NMX::IResult UInt64(std::uint64_t& value);
  NMX::IResult Double(double& value);
  NMX::IResult Text(std::string& value);

  /// What was expected where reading failed, such as "a text"; empty while nothing has failed.
  [[nodiscard]] std::string_view Expected() const { return m_expected; }

  /// True once the opening bracket has been read.
  [[nodiscard]] bool Begun() const { return m_begun; }

private:
  NMX::IResult Character(char expected, std::string_view name);

  template <class Convert>
  NMX::IResult Next(std::string_view expected, Convert convert);

  template <class Number>
  NMX::IResult Integer(std::string_view expected, Number& value);

  NMX::IResult Fail(NMX::EResult code, std::string_view expected);

  std::string_view& m_text;
  std::string_view m_expected;
  bool m_begun = false;
  bool m_first = true;
};

}
