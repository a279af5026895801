#include "StandaloneHost/Server/HttpOutput.h"

namespace Server
{

namespace
{

constexpr std::size_t copiedBytes = 16384; // a body up to this size is sent in one piece with its head

}

HttpOutput::Buffers HttpOutput::Put(const HttpHead& head, std::string_view body)
{
  const bool copied = body.size() <= copiedBytes;
  m_head = HeadText(head, body.size(), copied ? body.size() : 0);
  if (!copied)
    return Whole({body});
  m_head += body;
  return Whole({});
}

HttpOutput::Buffers HttpOutput::Put(const HttpHead& head, ResponseText body)
{
  if (body.IsPlain() && body.Size() <= copiedBytes)
    return Put(head, std::string_view(body.Own()));
  m_body = std::move(body);
  m_head = HeadText(head, m_body.Size(), 0);
  return Whole(m_body.PiecesFrom(0));
}

HttpOutput::Buffers HttpOutput::PutHead(const HttpHead& head, std::size_t bodyBytes)
{
  m_head = HeadText(head, bodyBytes, 0);
  return Whole({});
}

HttpOutput::Buffers HttpOutput::Whole(const std::vector<std::string_view>& pieces)
{
  m_held.Set(m_head.size() + m_body.OwnBytes());
  Buffers buffers{boost::asio::buffer(m_head)};
  buffers.reserve(1 + pieces.size());
  for (const std::string_view piece : pieces)
    buffers.emplace_back(piece.data(), piece.size());
  return buffers;
}

void HttpOutput::Clear()
{
  std::string().swap(m_head);
  m_body = {};
  m_held.Set(0);
}

}
