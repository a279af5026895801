#include "StandaloneHost/Server/ResponseText.h"

#include <algorithm>

namespace Server
{

void ResponseText::Append(ResponseText&& text)
{
  for (Insert& insert : text.m_shared)
    m_shared.push_back({m_own.size() + insert.position, std::move(insert.text)});
  m_own += text.m_own;
  m_sharedBytes += text.m_sharedBytes;
  text = {};
}

std::vector<std::string_view> ResponseText::PiecesFrom(std::size_t position) const
{
  std::vector<std::string_view> pieces;
  pieces.reserve(2 * m_shared.size() + 1);
  const auto take = [&](std::string_view piece)
  {
    const std::size_t passed = std::min(position, piece.size());
    position -= passed;
    if (passed < piece.size())
      pieces.push_back(piece.substr(passed));
  };
  const std::string_view own = m_own;
  std::size_t taken = 0;
  for (const Insert& insert : m_shared)
  {
    take(own.substr(taken, insert.position - taken));
    take(*insert.text);
    taken = insert.position;
  }
  take(own.substr(taken));
  return pieces;
}

std::string ResponseText::Flat() const
{
  std::string flat;
  flat.reserve(Size());
  for (const std::string_view piece : PiecesFrom(0))
    flat += piece;
  return flat;
}

}
