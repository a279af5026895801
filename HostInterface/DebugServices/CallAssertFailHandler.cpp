#include "HostInterface/DebugServices/CallAssertFailHandler.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <atomic>

namespace DebugServices
{

namespace
{

void LogAndGoOn(const char* expression, const char* file, unsigned line)
{
  NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "Assertion failed: %1% (%2%:%3%)", expression, file, line);
}

std::atomic<AssertFailHandler> current{&LogAndGoOn};

}

void SetAssertFailHandler(AssertFailHandler handler)
{
  current.store(handler != nullptr ? handler : &LogAndGoOn);
}

void CallAssertFailHandler(const char* expression, const char* file, unsigned line)
{
  current.load()(expression, file, line);
}

}
