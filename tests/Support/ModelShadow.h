#pragma once

#include "SubjectStoreUI/SubjectsModelRole.h"

#include <QAbstractItemModel>
#include <QAbstractItemModelTester>
#include <QPersistentModelIndex>

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

/// What a view knows of a model: what it has been told, and nothing else. As long as the model's signals are exact, it
/// is what the model says when it is asked.
class ModelShadow
{
public:
  /// Of the `untold` roles a model does not tell.
  explicit ModelShadow(QAbstractItemModel& model, QList<int> untold = {})
      : m_model(model), m_untold(std::move(untold)),
        m_tester(&model, QAbstractItemModelTester::FailureReportingMode::Fatal)
  {
    m_root = Read({});
    using M = QAbstractItemModel;
    QObject::connect(&model, &M::rowsInserted, &m_context,
                     [this](const QModelIndex& parent, int first, int last)
                     {
                       auto& rows = Find(parent).children;
                       for (int row = first; row <= last; ++row)
                         rows.insert(rows.begin() + row, Read(m_model.index(row, 0, parent)));
                       ++inserts;
                     });
    QObject::connect(&model, &M::rowsRemoved, &m_context,
                     [this](const QModelIndex& parent, int first, int last)
                     {
                       auto& rows = Find(parent).children;
                       rows.erase(rows.begin() + first, rows.begin() + last + 1);
                       ++removals;
                     });
    QObject::connect(&model, &M::dataChanged, &m_context,
                     [this](const QModelIndex& first, const QModelIndex& last, const QList<int>& roles)
                     {
                       for (int row = first.row(); row <= last.row(); ++row)
                       {
                         const QModelIndex index = m_model.index(row, 0, first.parent());
                         for (const int role : roles.isEmpty() ? SubjectStoreUI::SubjectsModelRole::All() : roles)
                           Find(index).values[role] = m_model.data(index, role);
                       }
                       ++changes;
                     });
    QObject::connect(&model, &M::modelReset, &m_context,
                     [this]
                     {
                       m_root = Read({});
                       ++resets;
                     });
    QObject::connect(&model, &M::layoutChanged, &m_context, [this] { m_root = Read({}); });
  }

  /// The model says what was told of it.
  void Check() const { Compare(m_root, Read({}), ""); }

  int inserts = 0;
  int removals = 0;
  int changes = 0;
  int resets = 0;

private:
  struct Row
  {
    QHash<int, QVariant> values;
    std::vector<Row> children;
  };

  [[nodiscard]] Row Read(const QModelIndex& index) const
  {
    Row row;
    if (index.isValid())
      for (const int role : SubjectStoreUI::SubjectsModelRole::All())
        row.values[role] = m_model.data(index, role);
    for (int child = 0; child < m_model.rowCount(index); ++child)
      row.children.push_back(Read(m_model.index(child, 0, index)));
    return row;
  }

  Row& Find(const QModelIndex& index)
  {
    return index.isValid() ? Find(index.parent()).children.at(static_cast<std::size_t>(index.row())) : m_root;
  }

  void Compare(const Row& told, const Row& asked, const std::string& place) const
  {
    for (auto value = asked.values.begin(); value != asked.values.end(); ++value)
      ASSERT_TRUE(m_untold.contains(value.key()) || told.values.value(value.key()) == value.value())
          << "role " << value.key() << " of row" << place;
    ASSERT_EQ(told.children.size(), asked.children.size()) << "rows beneath" << place;
    for (std::size_t row = 0; row < asked.children.size(); ++row)
      Compare(told.children[row], asked.children[row], place + ' ' + std::to_string(row));
  }

  QAbstractItemModel& m_model;
  const QList<int> m_untold;
  QAbstractItemModelTester m_tester;
  QObject m_context;
  Row m_root;
};
