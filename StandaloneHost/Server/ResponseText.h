#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Server
{

/// A text on its way to a client: its own, with texts between that many share and that take no memory of their own.
class ResponseText
{
public:
  using Shared = std::shared_ptr<const std::string>;

  ResponseText() = default;
  ResponseText(std::string text) : m_own(std::move(text)) {}

  void Append(std::string_view text) { m_own += text; }

  void Append(Shared text)
  {
    m_sharedBytes += text->size();
    m_shared.push_back({m_own.size(), std::move(text)});
  }

  void Append(ResponseText&& text);

  /// Its length, and how much of it is its own.
  [[nodiscard]] std::size_t Size() const { return m_own.size() + m_sharedBytes; }
  [[nodiscard]] std::size_t OwnBytes() const { return m_own.size(); }
  [[nodiscard]] bool Empty() const { return Size() == 0; }

  /// Whether all of it is its own, so that Own is the text.
  [[nodiscard]] bool IsPlain() const { return m_shared.empty(); }
  [[nodiscard]] const std::string& Own() const { return m_own; }

  /// Its pieces from a position on, in order; valid as long as the text.
  [[nodiscard]] std::vector<std::string_view> PiecesFrom(std::size_t position) const;

  /// A copy in one piece.
  [[nodiscard]] std::string Flat() const;

private:
  struct Insert
  {
    std::size_t position; // in the own text, before which the shared text stands
    Shared text;
  };

  std::string m_own;
  std::vector<Insert> m_shared; // in ascending order
  std::size_t m_sharedBytes = 0;
};

}
