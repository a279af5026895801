#include "StandaloneHost/Window/LogFeed.h"

namespace Window
{

LogFeed::LogFeed(VLogModel& model) : m_former(NMX::GlobalLog::SetSink(nullptr))
{
  NMX::GlobalLog::SetSink(
      [&model, former = m_former](const NMX::LogRecord& record)
      {
        former(record);
        model.Append(record);
      });
}

LogFeed::~LogFeed()
{
  NMX::GlobalLog::SetSink(m_former);
}

}
