#pragma once

#include "StandaloneHost/Logging/LogWriter.h"
#include "StandaloneHost/Window/VLogModel.h"

namespace Window
{

/// While it lives, a model gets the messages that a writer of the log lets pass, as they are written. [host]
class LogFeed
{
public:
  LogFeed(Logging::LogWriter& writer, VLogModel& model);
  LogFeed(const LogFeed&) = delete;
  LogFeed& operator=(const LogFeed&) = delete;
  ~LogFeed();

private:
  Logging::LogWriter& m_writer;
};

}
