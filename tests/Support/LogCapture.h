#pragma once

#include "HostInterface/NMX/GlobalLog.h"

#include <string>
#include <vector>

/// Collects the messages that are logged while it lives, whatever their severity.
class LogCapture
{
public:
  LogCapture()
  {
    NMX::GlobalLog::SetLevel(NMX::ESeverity::Trace);
    NMX::GlobalLog::SetSink([this](const NMX::LogRecord& record) { messages.emplace_back(record.text); });
  }
  LogCapture(const LogCapture&) = delete;
  LogCapture& operator=(const LogCapture&) = delete;
  ~LogCapture()
  {
    NMX::GlobalLog::SetSink(nullptr);
    NMX::GlobalLog::SetLevel(NMX::ESeverity::Notice);
  }

  std::vector<std::string> messages;
};
