#include "HostInterface/LoggingDetail/PrintableText.h"
#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Application.h"
#include "StandaloneHost/CommandLine/CommandLine.h"
#include "StandaloneHost/Logging/StandardStreams.h"

#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <string>
#include <unistd.h>

namespace
{

/// Exit status for whatever keeps the host from starting.
constexpr int cannotStart = 2;

/// SIGINT and SIGTERM are waited for, not handled: no thread is interrupted by them. A peer that is gone and a file
/// that may not grow are errors of the calls that meet them, and a terminal that is in the foreground of other programs
/// does not stop this one when it logs.
void BlockSignals()
{
  sigset_t signals;
  sigemptyset(&signals);
  sigaddset(&signals, SIGINT);
  sigaddset(&signals, SIGTERM);
  pthread_sigmask(SIG_BLOCK, &signals, nullptr);
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
  std::signal(SIGTTOU, SIG_IGN);
}

/// An exception that nobody has caught, or one where none may be: the log tells of it before the program ends.
[[noreturn]] void EndUncaught()
{
  std::string what = "no exception";
  try
  {
    if (const auto current = std::current_exception())
      std::rethrow_exception(current);
  }
  catch (const std::exception& failure)
  {
    what = failure.what();
  }
  catch (...)
  {
    what = "an unknown exception";
  }
  NMX::Log(NMX::systemLog, NMX::ESeverity::Fatal, "The program cannot go on: %1%", what);
  std::abort();
}

/// The one line that says why the host does not start, whether somebody reads it or not.
void TellOf(const std::exception& failure)
{
  constexpr std::size_t longest = 4096;
  (void)Logging::WriteWithin(STDERR_FILENO,
                             "subject-store-host: " + LoggingDetail::PrintableText(failure.what(), longest) + '\n',
                             Logging::patience);
}

}

int main(int argumentCount, char** arguments)
{
  if (CommandLine::IsCommandLine(argumentCount, arguments))
    return CommandLine::RunCommandLine(argumentCount, arguments);
  try
  {
    Logging::OpenStandardDescriptors();
    BlockSignals();
    std::set_terminate(&EndUncaught);
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
    TellOf(failure);
    return cannotStart;
  }
}
