#pragma once

#include <cstddef>
#include <memory>
#include <unordered_map>
#include <utility>
#include <vector>

namespace SubjectStoreUI
{

/// Rows in an order of their own; a row stays at its address for as long as it exists. `Row` has Key(), which tells it
/// from its siblings and never changes. Made for some dozens.
template <class Row>
class SequenceRows
{
public:
  using Key = decltype(std::declval<const Row&>().Key());
  using Cursor = std::size_t;

  [[nodiscard]] int Count() const { return static_cast<int>(m_rows.size()); }
  [[nodiscard]] bool Empty() const { return m_rows.empty(); }
  [[nodiscard]] Cursor Begin() const { return 0; }
  [[nodiscard]] Cursor End() const { return m_rows.size(); }
  [[nodiscard]] Key KeyAt(Cursor cursor) const { return m_rows[cursor]->Key(); }
  [[nodiscard]] Row& At(Cursor cursor) const { return *m_rows[cursor]; }
  [[nodiscard]] Row& At(int row) const { return *m_rows[static_cast<std::size_t>(row)]; }

  /// The position of a row that there is.
  [[nodiscard]] int PositionOf(Key key) const
  {
    int position = 0;
    while (m_rows[static_cast<std::size_t>(position)]->Key() != key)
      ++position;
    return position;
  }

  /// Whether rows stay: those whose key is among the new ones, as long as they keep their order. Asked in the order of
  /// the rows.
  template <class Changes>
  class Matcher
  {
  public:
    explicit Matcher(const Changes& now)
    {
      for (const auto& change : now)
        m_positions.emplace(change.key, m_positions.size());
    }

    [[nodiscard]] bool Stays(Key key)
    {
      const auto found = m_positions.find(key);
      if (found == m_positions.end() || found->second < m_next)
        return false;
      m_next = found->second + 1;
      return true;
    }

  private:
    std::unordered_map<Key, std::size_t> m_positions;
    std::size_t m_next = 0;
  };

  Cursor Erase(Cursor cursor)
  {
    m_rows.erase(m_rows.begin() + static_cast<std::ptrdiff_t>(cursor));
    return cursor;
  }

  template <class... Arguments>
  Cursor Insert(Cursor before, Arguments&&... arguments)
  {
    m_rows.insert(m_rows.begin() + static_cast<std::ptrdiff_t>(before),
                  std::make_unique<Row>(std::forward<Arguments>(arguments)...));
    return before;
  }

  void Clear() { m_rows.clear(); }

private:
  std::vector<std::unique_ptr<Row>> m_rows;
};

}
