// What a client sends: taking a message apart must never crash, and what comes out must hold together.

#include "StandaloneHost/Server/Envelope.h"

#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const unsigned char* data, std::size_t size)
{
  const Server::Limits limits;
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  const Server::Message message = Server::ReadMessage(text, limits);
  if (message.requests.size() > limits.batchCalls || (message.requests.empty() && !message.complaint))
    std::abort();
  if (message.complaint)
    return 0;
  for (const Server::Request& request : message.requests)
  {
    // A complaint is answered, so it needs an id.
    if (request.complaint && request.id.empty())
      std::abort();
    if (request.params.front() == '{')
      (void)Server::ReadMembers(request.params, limits);
    else if (request.params.front() == '[')
      (void)Server::ReadTexts(request.params);
    else
      std::abort();
  }
  return 0;
}
