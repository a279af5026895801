#include "HostInterface/LoggingDetail/GlobalLogStream.h"

#include <boost/format.hpp>

namespace LoggingDetail
{

std::string GlobalLogStream::Text() const noexcept
{
  try
  {
    if (!m_failed)
    {
      boost::format message{std::string(m_format)};
      for (const auto& argument : m_arguments)
        message % argument;
      return message.str();
    }
  }
  catch (...)
  {
    return CannotFormat();
  }
  return CannotFormat();
}

std::string GlobalLogStream::CannotFormat() const noexcept
{
  try
  {
    return "Cannot Format Log Message \"" + std::string(m_format) + '"';
  }
  catch (...)
  {
    return {};
  }
}

}
