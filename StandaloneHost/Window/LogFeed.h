#pragma once

#include "StandaloneHost/Window/VLogModel.h"

namespace Window
{

/// While it lives, a model gets what is logged, beside whoever got it before. [host]
class LogFeed
{
public:
  explicit LogFeed(VLogModel& model);
  LogFeed(const LogFeed&) = delete;
  LogFeed& operator=(const LogFeed&) = delete;
  ~LogFeed();

private:
  const NMX::GlobalLog::Sink m_former;
};

}
