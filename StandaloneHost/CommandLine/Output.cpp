#include "StandaloneHost/CommandLine/Output.h"

#include "StandaloneHost/CommandLine/CommandError.h"

#include <cerrno>
#include <cstdio>
#include <system_error>

namespace CommandLine
{

void Print(std::string_view text)
{
  errno = 0;
  const bool written = std::fwrite(text.data(), 1, text.size(), stdout) == text.size();
  if (written && std::fflush(stdout) == 0)
    return;
  if (errno == EPIPE)
    throw Ended{};
  throw CommandError(EStatus::Failed, "the output cannot be written: " + std::generic_category().message(errno));
}

void Tell(std::string_view text)
{
  std::fprintf(stderr, "subject-store-host: %.*s\n", static_cast<int>(text.size()), text.data());
}

}
