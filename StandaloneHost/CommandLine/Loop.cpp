#include "StandaloneHost/CommandLine/Loop.h"

#include "StandaloneHost/CommandLine/CommandError.h"

#include <boost/asio/executor_work_guard.hpp>
#include <boost/asio/io_context.hpp>
#include <boost/asio/posix/stream_descriptor.hpp>
#include <boost/asio/signal_set.hpp>

#include <csignal>
#include <sys/stat.h>
#include <unistd.h>

namespace CommandLine
{

using boost::system::error_code;

struct Loop::Parts
{
  boost::asio::io_context context{1};
  boost::asio::executor_work_guard<boost::asio::io_context::executor_type> work{context.get_executor()};
  boost::asio::signal_set signals{context};
  boost::asio::posix::stream_descriptor output{context};
  int signal = 0;
  bool ended = false;
};

Loop::Loop() : m_parts(std::make_unique<Parts>()) {}

Loop::~Loop() = default;

boost::asio::io_context& Loop::Context()
{
  return m_parts->context;
}

int Loop::Signal() const
{
  return m_parts->signal;
}

void Loop::HearSignals()
{
  m_parts->signals.add(SIGINT);
  m_parts->signals.add(SIGTERM);
  m_parts->signals.async_wait(
      [parts = m_parts.get()](error_code error, int signal)
      {
        if (error)
          return;
        parts->signal = signal;
        parts->ended = true;
      });
}

void Loop::WatchOutput()
{
  struct stat status = {};
  if (fstat(STDOUT_FILENO, &status) != 0 || (!S_ISFIFO(status.st_mode) && !S_ISSOCK(status.st_mode)))
    return;
  const int copy = dup(STDOUT_FILENO);
  if (copy < 0)
    return;
  error_code error;
  error = m_parts->output.assign(copy, error);
  if (error)
  {
    close(copy);
    return;
  }
  m_parts->output.async_wait(boost::asio::posix::stream_descriptor::wait_error,
                             [parts = m_parts.get()](error_code failure)
                             {
                               if (!failure)
                                 parts->ended = true;
                             });
}

bool Loop::RunUntil(const std::function<bool()>& done, Clock::time_point deadline)
{
  while (!done())
  {
    if (m_parts->ended)
      throw Ended{};
    if (Clock::now() >= deadline)
      return false;
    m_parts->context.run_one_until(deadline);
  }
  return true;
}

bool Loop::Finish(const std::function<bool()>& done, Clock::time_point deadline)
{
  while (!done() && Clock::now() < deadline)
    m_parts->context.run_one_until(deadline);
  return done();
}

void Loop::Sleep(std::chrono::milliseconds time)
{
  (void)RunUntil([] { return false; }, Clock::now() + time);
}

}
