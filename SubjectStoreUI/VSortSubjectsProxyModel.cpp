#include "SubjectStoreUI/VSortSubjectsProxyModel.h"

#include "SubjectStoreUI/NaturalOrder.h"

#include <algorithm>
#include <cstddef>
#include <numeric>
#include <utility>

namespace SubjectStoreUI
{

VSortSubjectsProxyModel::VSortSubjectsProxyModel(std::shared_ptr<QAbstractItemModel> source,
                                                 VSubjectTypeGadget allowedSubjectType, QString typeDisplayName,
                                                 VSubjectWarningSummary* warningSummary, int role, QObject* parent)
    : QSortFilterProxyModel(parent), m_source(std::move(source)), m_allowedSubjectType(allowedSubjectType),
      m_typeDisplayName(std::move(typeDisplayName)), m_warningSummary(warningSummary)
{
  m_due.setSingleShot(true);
  m_due.setInterval(0);
  connect(&m_due, &QTimer::timeout, this, [this] { sort(sortColumn(), sortOrder()); });
  // Before anybody else hears of the new order, and reads and edits.
  connect(this, &QAbstractItemModel::layoutChanged, this, [this] { m_level.reset(); });
  setDynamicSortFilter(false);
  setSortRole(role);
  if (m_source)
    Follow(*m_source);
  VSortSubjectsProxyModel::sort(0, Qt::AscendingOrder);
}

void VSortSubjectsProxyModel::Follow(QAbstractItemModel& source)
{
  // The base class sorts while it hears of a reset: these two come before and after it.
  connect(&source, &QAbstractItemModel::modelReset, this,
          [this]
          {
            m_level.emplace();
            Arm();
          });
  setSourceModel(&source);
  connect(&source, &QAbstractItemModel::modelReset, this, [this] { m_level.reset(); });
  connect(&source, &QAbstractItemModel::rowsInserted, this, &VSortSubjectsProxyModel::Arm);
  connect(&source, &QAbstractItemModel::dataChanged, this,
          [this](const QModelIndex&, const QModelIndex&, const QList<int>& roles)
          {
            if (roles.isEmpty() || roles.contains(sortRole()))
              Arm();
          });
}

void VSortSubjectsProxyModel::Arm()
{
  if (m_level)
    m_level->ids.clear(); // what it holds is old
  if (!m_due.isActive())
    m_due.start();
}

void VSortSubjectsProxyModel::sort(int column, Qt::SortOrder order)
{
  m_due.stop();
  m_level.emplace();
  QSortFilterProxyModel::sort(column, order);
  m_level.reset();
}

bool VSortSubjectsProxyModel::lessThan(const QModelIndex& left, const QModelIndex& right) const
{
  if (!m_level)
    return NaturallyLess(Text(left), Text(right));
  // Ranks, so that of the many comparisons only one read of the texts remains for each row.
  if (!m_level->Holds(left) || !m_level->Holds(right))
    m_level = Rank(*left.model(), left.column(), left.parent());
  return m_level->ranks[static_cast<std::size_t>(left.row())] < m_level->ranks[static_cast<std::size_t>(right.row())];
}

bool VSortSubjectsProxyModel::Level::Holds(const QModelIndex& index) const
{
  const auto row = static_cast<std::size_t>(index.row());
  return row < ids.size() && ids[row] == index.internalId();
}

std::string VSortSubjectsProxyModel::Text(const QModelIndex& index) const
{
  // What is one name in two forms of Unicode stands in one place.
  return index.data(sortRole()).toString().normalized(QString::NormalizationForm_C).toStdString();
}

VSortSubjectsProxyModel::Level VSortSubjectsProxyModel::Rank(const QAbstractItemModel& model, int column,
                                                             const QModelIndex& parent) const
{
  Level level;
  std::vector<std::string> texts;
  const int count = model.rowCount(parent);
  for (int row = 0; row < count; ++row)
  {
    const QModelIndex index = model.index(row, column, parent);
    level.ids.push_back(index.internalId());
    texts.push_back(Text(index));
  }
  std::vector<std::size_t> order(texts.size());
  std::iota(order.begin(), order.end(), std::size_t{0});
  std::sort(order.begin(), order.end(),
            [&](std::size_t left, std::size_t right) { return NaturallyLess(texts[left], texts[right]); });
  level.ranks.resize(texts.size());
  int rank = 0;
  for (std::size_t place = 0; place < order.size(); ++place)
  {
    rank += place > 0 && texts[order[place]] != texts[order[place - 1]];
    level.ranks[order[place]] = rank;
  }
  return level;
}

}
