#include "SubjectStoreUI/PanelRowList.h"

#include <algorithm>
#include <iterator>
#include <tuple>
#include <utility>

namespace SubjectStoreUI
{

namespace
{

using RowPointers = std::vector<PanelRow*>;

/// So many signals are better for a view, which animates rows and keeps its place, than one that says "all of them".
constexpr std::size_t fewSignals = 32;

struct Run
{
  std::size_t first;
  std::size_t count;
};

template <class Belongs>
std::vector<Run> RunsOf(const RowPointers& rows, Belongs belongs)
{
  std::vector<Run> runs;
  for (std::size_t at = 0; at < rows.size(); ++at)
  {
    if (!belongs(*rows[at]))
      continue;
    if (runs.empty() || runs.back().first + runs.back().count != at)
      runs.push_back({at, 0});
    ++runs.back().count;
  }
  return runs;
}

void Number(const RowPointers& rows)
{
  for (std::size_t at = 0; at < rows.size(); ++at)
    rows[at]->row = static_cast<int>(at);
}

bool IsDropped(const PanelRow& row)
{
  return row.wanted < 0;
}

bool IsNew(const PanelRow& row)
{
  return row.row < 0;
}

}

int PanelRowList::rowCount(const QModelIndex& parent) const
{
  return parent.isValid() ? 0 : StartOf(m_rows.size());
}

int PanelRowList::StartOf(std::size_t section) const
{
  std::size_t start = 0;
  for (std::size_t before = 0; before < section; ++before)
    start += m_rows[before].size();
  return static_cast<int>(start);
}

PanelRowList::Place PanelRowList::At(int row) const
{
  auto left = static_cast<std::size_t>(row);
  for (std::size_t section = 0; row >= 0 && section < m_rows.size(); ++section)
  {
    if (left < m_rows[section].size())
      return {section, m_rows[section][left]};
    left -= m_rows[section].size();
  }
  return {};
}

int PanelRowList::RowOf(std::size_t section, const PanelRow& row) const
{
  if (row.row < 0)
    return -1;
  const RowPointers& rows = m_rows[section];
  const auto at = static_cast<std::size_t>(row.row);
  if (at >= rows.size() || rows[at] != &row)
    Number(rows);
  return StartOf(section) + row.row;
}

void PanelRowList::Become(std::size_t section, const RowPointers& wanted)
{
  for (PanelRow* row : m_rows[section])
    row->wanted = -1;
  for (std::size_t at = 0; at < wanted.size(); ++at)
    wanted[at]->wanted = static_cast<int>(at);
  Drop(section);
  Order(section);
  Add(section, wanted);
}

void PanelRowList::Drop(std::size_t section)
{
  RowPointers& rows = m_rows[section];
  auto runs = RunsOf(rows, IsDropped);
  if (runs.size() > fewSignals)
  {
    RowPointers order = rows;
    std::stable_partition(order.begin(), order.end(), [](const PanelRow* row) { return !IsDropped(*row); });
    Arrange(section, std::move(order));
    runs = RunsOf(rows, IsDropped);
  }
  const int start = StartOf(section);
  for (auto run = runs.rbegin(); run != runs.rend(); ++run)
  {
    const int first = start + static_cast<int>(run->first);
    beginRemoveRows({}, first, first + static_cast<int>(run->count) - 1);
    const auto begin = rows.begin() + static_cast<std::ptrdiff_t>(run->first);
    const auto end = begin + static_cast<std::ptrdiff_t>(run->count);
    std::for_each(begin, end, [](PanelRow* row) { row->row = -1; });
    rows.erase(begin, end);
    endRemoveRows();
  }
}

void PanelRowList::Order(std::size_t section)
{
  RowPointers& rows = m_rows[section];
  RowPointers order = rows;
  std::sort(order.begin(), order.end(),
            [](const PanelRow* left, const PanelRow* right) { return left->wanted < right->wanted; });
  Number(rows);
  std::size_t breaks = 0;
  for (std::size_t at = 1; at < order.size(); ++at)
    breaks += order[at]->row != order[at - 1]->row + 1;
  if (breaks > fewSignals)
    return Arrange(section, std::move(order));
  const int start = StartOf(section);
  for (auto to = rows.begin();;)
  {
    auto next = order.begin() + (to - rows.begin());
    std::tie(to, next) = std::mismatch(to, rows.end(), next);
    if (to == rows.end())
      return;
    const auto from = std::find(to, rows.end(), *next);
    const auto end = std::mismatch(from, rows.end(), next).first;
    const auto number = [&](auto at) { return start + static_cast<int>(at - rows.begin()); };
    beginMoveRows({}, number(from), number(end) - 1, {}, number(to));
    std::rotate(to, from, end);
    endMoveRows();
  }
}

void PanelRowList::Add(std::size_t section, const RowPointers& wanted)
{
  const auto runs = RunsOf(wanted, IsNew);
  if (runs.size() > fewSignals)
  {
    RowPointers added;
    std::copy_if(wanted.begin(), wanted.end(), std::back_inserter(added),
                 [](const PanelRow* row) { return IsNew(*row); });
    Insert(section, m_rows[section].size(), added);
    return Arrange(section, wanted);
  }
  for (const Run& run : runs)
  {
    const auto begin = wanted.begin() + static_cast<std::ptrdiff_t>(run.first);
    Insert(section, run.first, RowPointers(begin, begin + static_cast<std::ptrdiff_t>(run.count)));
  }
}

void PanelRowList::Insert(std::size_t section, std::size_t at, const RowPointers& added)
{
  const int first = StartOf(section) + static_cast<int>(at);
  beginInsertRows({}, first, first + static_cast<int>(added.size()) - 1);
  RowPointers& rows = m_rows[section];
  rows.insert(rows.begin() + static_cast<std::ptrdiff_t>(at), added.begin(), added.end());
  for (std::size_t each = 0; each < added.size(); ++each)
    added[each]->row = static_cast<int>(at + each);
  endInsertRows();
}

void PanelRowList::Arrange(std::size_t section, RowPointers order)
{
  RowPointers& rows = m_rows[section];
  if (rows == order)
    return;
  // Views read the rows that they show again; the hint keeps them from taking it for another content.
  Q_EMIT layoutAboutToBeChanged({}, VerticalSortHint);
  const int start = StartOf(section);
  const RowPointers before = std::exchange(rows, std::move(order));
  Number(rows);
  QModelIndexList from;
  QModelIndexList to;
  for (const QModelIndex& index : persistentIndexList())
  {
    const int at = index.row() - start;
    if (at < 0 || at >= static_cast<int>(before.size()))
      continue;
    from.append(index);
    to.append(createIndex(start + before[static_cast<std::size_t>(at)]->row, index.column()));
  }
  changePersistentIndexList(from, to);
  Q_EMIT layoutChanged({}, VerticalSortHint);
}

}
