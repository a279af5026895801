#pragma once

#include "HostInterface/NMX/ITypedId.h"

#include <boost/multi_index/ranked_index.hpp>
#include <boost/multi_index_container.hpp>

#include <cstddef>
#include <utility>
#include <vector>

namespace SubjectStoreUI
{

/// Rows in ascending order of their subjects' ids; a row stays at its address for as long as it exists, and its
/// position is found in logarithmic time. `Row` has Subject(), which never changes.
template <class Row>
class RankedRows
{
  struct SubjectOf
  {
    using result_type = NMX::TSubjectStoreId;
    result_type operator()(const Row& row) const { return row.Subject(); }
  };
  using Container =
      boost::multi_index_container<Row, boost::multi_index::indexed_by<boost::multi_index::ranked_unique<SubjectOf>>>;

public:
  using Key = NMX::TSubjectStoreId;
  using Cursor = typename Container::iterator;

  [[nodiscard]] int Count() const { return static_cast<int>(m_rows.size()); }
  [[nodiscard]] bool Empty() const { return m_rows.empty(); }
  [[nodiscard]] Cursor Begin() const { return m_rows.begin(); }
  [[nodiscard]] Cursor End() const { return m_rows.end(); }

  static Key KeyAt(Cursor cursor) { return cursor->Subject(); }
  /// A row may be changed, but for its subject.
  static Row& At(Cursor cursor) { return const_cast<Row&>(*cursor); }

  /// There is such a row. Whoever reads many between two changes, as sorting does, soon finds each in one step.
  [[nodiscard]] Row& At(int row) const
  {
    if (m_byPosition.empty() && ++m_lookups > m_rows.size())
      for (const Row& each : m_rows)
        m_byPosition.push_back(const_cast<Row*>(&each));
    return m_byPosition.empty() ? At(m_rows.nth(static_cast<std::size_t>(row)))
                                : *m_byPosition[static_cast<std::size_t>(row)];
  }

  [[nodiscard]] Row* Find(Key key) const
  {
    const Cursor found = m_rows.find(key);
    return found != m_rows.end() ? &At(found) : nullptr;
  }

  /// The position of a row that there is.
  [[nodiscard]] int PositionOf(Key key) const { return static_cast<int>(m_rows.find_rank(key)); }

  /// Whether rows stay: those whose key is among the new ones. Asked in the order of the rows.
  template <class Changes>
  class Matcher
  {
  public:
    explicit Matcher(const Changes& now) : m_next(now.begin()), m_end(now.end()) {}

    [[nodiscard]] bool Stays(Key key)
    {
      while (m_next != m_end && m_next->key < key)
        ++m_next;
      return m_next != m_end && m_next->key == key;
    }

  private:
    typename Changes::const_iterator m_next;
    const typename Changes::const_iterator m_end;
  };

  Cursor Erase(Cursor cursor)
  {
    ForgetPositions();
    return m_rows.erase(cursor);
  }

  /// Inserts a row right before the cursor.
  template <class... Arguments>
  Cursor Insert(Cursor before, Arguments&&... arguments)
  {
    ForgetPositions();
    return m_rows.emplace_hint(before, std::forward<Arguments>(arguments)...);
  }

  void Clear()
  {
    ForgetPositions();
    m_rows.clear();
  }

private:
  void ForgetPositions()
  {
    m_byPosition.clear();
    m_lookups = 0;
  }

  Container m_rows;
  mutable std::vector<Row*> m_byPosition; ///< empty until it pays
  mutable std::size_t m_lookups = 0;      ///< since the last change
};

}
