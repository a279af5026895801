#include "StandaloneHost/Logging/StandardStreams.h"

#include <cerrno>
#include <exception>
#include <fcntl.h>
#include <future>
#include <memory>
#include <poll.h>
#include <thread>
#include <unistd.h>
#include <utility>

namespace Logging
{

void OpenStandardDescriptors()
{
  int descriptor = -1;
  do
    descriptor = open("/dev/null", O_RDWR);
  while (descriptor >= 0 && descriptor <= STDERR_FILENO);
  if (descriptor > STDERR_FILENO)
    close(descriptor);
}

bool WriteAll(int descriptor, std::string_view text, bool& begun)
{
  while (!text.empty())
  {
    const ssize_t written = write(descriptor, text.data(), text.size());
    if (written > 0)
    {
      begun = true;
      text.remove_prefix(static_cast<std::size_t>(written));
    }
    else if (written < 0 && errno == EAGAIN) // another program that has the descriptor does not wait
    {
      pollfd waiting{descriptor, POLLOUT, 0};
      (void)poll(&waiting, 1, -1);
    }
    else if (written == 0 || errno != EINTR)
      return false;
  }
  return true;
}

bool WriteWithin(int descriptor, std::string text, std::chrono::milliseconds time)
{
  try
  {
    const auto written = std::make_shared<std::promise<bool>>();
    std::future<bool> result = written->get_future();
    std::thread(
        [descriptor, written, content = std::move(text)]
        {
          bool begun = false;
          written->set_value(WriteAll(descriptor, content, begun));
        })
        .detach();
    return result.wait_for(time) == std::future_status::ready && result.get();
  }
  catch (const std::exception&)
  {
    return false;
  }
}

}
