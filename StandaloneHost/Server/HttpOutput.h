#pragma once

#include "StandaloneHost/Server/HttpHead.h"
#include "StandaloneHost/Server/OutgoingBytes.h"
#include "StandaloneHost/Server/ResponseText.h"

#include <boost/asio/buffer.hpp>

#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Server
{

/// The response that is being sent over an HTTP connection, and what it takes up of the memory for responses. [server]
class HttpOutput
{
public:
  using Buffers = std::vector<boost::asio::const_buffer>;

  explicit HttpOutput(std::shared_ptr<OutgoingBytes> outgoing) : m_held(std::move(outgoing)) {}

  /// A head with its body: what is to be sent. A long body stays where it is and has to last until it has been sent.
  [[nodiscard]] Buffers Put(const HttpHead& head, std::string_view body);

  /// The same with a body that is kept here.
  [[nodiscard]] Buffers Put(const HttpHead& head, ResponseText body);

  /// The head alone, as if the body came with it.
  [[nodiscard]] Buffers PutHead(const HttpHead& head, std::size_t bodyBytes);

  /// It has been sent.
  void Clear();

private:
  [[nodiscard]] Buffers Whole(const std::vector<std::string_view>& pieces);

  std::string m_head; // with a short body
  ResponseText m_body;
  HeldBytes m_held;
};

}
