#include "StandaloneHost/Window/LogFeed.h"

namespace Window
{

LogFeed::LogFeed(Logging::LogWriter& writer, VLogModel& model) : m_writer(writer)
{
  m_writer.SetListener([&model](const NMX::LogRecord& record) { model.Append(record); });
}

LogFeed::~LogFeed()
{
  m_writer.SetListener(nullptr);
}

}
