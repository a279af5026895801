#include "StandaloneHost/Application.h"
#include "StandaloneHost/CommandLine/CommandLine.h"

#include <csignal>
#include <cstdio>
#include <exception>

namespace
{

/// Exit status for whatever keeps the host from starting.
constexpr int cannotStart = 2;

/// SIGINT and SIGTERM are waited for, not handled: no thread is interrupted by them. A peer that is gone and a file
/// that may not grow are errors of the calls that meet them.
void BlockSignals()
{
  sigset_t signals;
  sigemptyset(&signals);
  sigaddset(&signals, SIGINT);
  sigaddset(&signals, SIGTERM);
  pthread_sigmask(SIG_BLOCK, &signals, nullptr);
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
}

}

int main(int argumentCount, char** arguments)
{
  if (CommandLine::IsCommandLine(argumentCount, arguments))
    return CommandLine::RunCommandLine(argumentCount, arguments);
  try
  {
    BlockSignals();
    const Request request = ReadOptions(argumentCount, arguments);
    if (request.help)
    {
      std::fputs(request.helpText.c_str(), stdout);
      return 0;
    }
    NMX::GlobalLog::SetLevel(request.options.logLevel);
    RunApplication(request.options);
    return 0;
  }
  catch (const std::exception& failure)
  {
    std::fprintf(stderr, "subject-store-host: %s\n", failure.what());
    return cannotStart;
  }
}
