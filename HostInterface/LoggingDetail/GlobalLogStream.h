#pragma once

#include <concepts>
#include <cstdint>
#include <sstream>
#include <string>
#include <string_view>
#include <vector>

namespace LoggingDetail
{

/// Collects the arguments of one log message and puts them in the places of its placeholders.
class GlobalLogStream
{
public:
  explicit GlobalLogStream(std::string_view format) : m_format(format) {}

  template <class Argument>
  void Add(const Argument& argument) noexcept
  {
    try
    {
      if constexpr (std::convertible_to<const Argument&, std::string_view>)
        m_arguments.emplace_back(std::string_view(argument));
      else
      {
        std::ostringstream text;
        text << std::boolalpha << argument;
        m_arguments.push_back(std::move(text).str());
      }
    }
    catch (...)
    {
      m_failed = true;
    }
  }

  /// The message; `Cannot Format Log Message "FORMAT"` when format and arguments do not fit. Never throws.
  [[nodiscard]] std::string Text() const noexcept;

private:
  [[nodiscard]] std::string CannotFormat() const noexcept;

  std::string_view m_format;
  std::vector<std::string> m_arguments;
  bool m_failed = false;
};

}
