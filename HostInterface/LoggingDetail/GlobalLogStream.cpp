#include "HostInterface/LoggingDetail/GlobalLogStream.h"

#include <boost/format.hpp>

namespace LoggingDetail
{

std::string GlobalLogStream::Text() const noexcept
{
  if (!m_failed)
  {
    try
    {
      boost::format message{std::string(m_format)};
      for (const auto& argument : m_arguments)
        message % argument;
      return message.str();
    }
    catch (...)
    {
    }
  }
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
