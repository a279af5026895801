#include "StandaloneHost/StopSignals.h"

#include <QCoreApplication>

#include <csignal>
#include <sys/signalfd.h>
#include <system_error>
#include <unistd.h>

namespace
{

int OpenSignals()
{
  sigset_t signals;
  sigemptyset(&signals);
  sigaddset(&signals, SIGINT);
  sigaddset(&signals, SIGTERM);
  const int descriptor = signalfd(-1, &signals, SFD_CLOEXEC | SFD_NONBLOCK);
  if (descriptor < 0)
    throw std::system_error(errno, std::generic_category(), "cannot wait for signals");
  return descriptor;
}

}

StopSignals::StopSignals() : m_descriptor(OpenSignals()), m_notifier(m_descriptor, QSocketNotifier::Read)
{
  // Not quit(), which asks the windows first and takes a no.
  QObject::connect(&m_notifier, &QSocketNotifier::activated, &m_notifier,
                   [this]
                   {
                     signalfd_siginfo received;
                     [[maybe_unused]] const ssize_t size = read(m_descriptor, &received, sizeof received);
                     QCoreApplication::exit(0);
                   });
}

StopSignals::~StopSignals()
{
  m_notifier.setEnabled(false);
  close(m_descriptor);
}
