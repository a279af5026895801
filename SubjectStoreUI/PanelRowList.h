#pragma once

#include "SubjectStoreUI/PanelRow.h"

#include <QAbstractListModel>

#include <cstddef>
#include <vector>

namespace SubjectStoreUI
{

/// The rows that views know of, section after section, and how they become others: few signals with exact rows where
/// little changes, and a fixed number of signals where much does, so that thousands of rows never cost thousands of
/// signals. Persistent indexes stay with their rows in either case. [gui]
class PanelRowList : public QAbstractListModel
{
public:
  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override;

protected:
  PanelRowList(std::size_t sections, QObject* parent) : QAbstractListModel(parent), m_rows(sections) {}

  struct Place
  {
    std::size_t section = 0;
    PanelRow* row = nullptr;
  };

  /// What is in a row of the list; null when there is no such row.
  [[nodiscard]] Place At(int row) const;
  /// A row's number in the list; -1 when it is not shown.
  [[nodiscard]] int RowOf(std::size_t section, const PanelRow& row) const;
  [[nodiscard]] const std::vector<PanelRow*>& Rows(std::size_t section) const { return m_rows[section]; }

  /// Makes the rows of a section these, in their order.
  void Become(std::size_t section, const std::vector<PanelRow*>& wanted);

private:
  [[nodiscard]] int StartOf(std::size_t section) const;
  void Drop(std::size_t section);
  void Order(std::size_t section);
  void Add(std::size_t section, const std::vector<PanelRow*>& wanted);
  void Insert(std::size_t section, std::size_t at, const std::vector<PanelRow*>& rows);
  /// One signal for any other order of the same rows.
  void Arrange(std::size_t section, std::vector<PanelRow*> order);

  std::vector<std::vector<PanelRow*>> m_rows;
};

}
