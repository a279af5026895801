#pragma once

#include "SubjectStoreUI/PanelRow.h"
#include "SubjectStoreUI/VSortSubjectsProxyModel.h"

#include <QModelIndex>
#include <QObject>
#include <QPointer>

#include <functional>
#include <memory>
#include <unordered_map>
#include <vector>

namespace SubjectStoreUI
{

/// Which rows a section's model has, followed signal by signal, so that each keeps its identity: a subject has an id,
/// but an empty slot and a marker have none. Signals are only noted down; the model is read in Update, when all of a
/// burst have come. [gui]
class PanelSection
{
public:
  /// `changed`: there is something to update. `dataChanged`: the model told of a row, which it has.
  PanelSection(VSortSubjectsProxyModel* model, std::function<void()> changed,
               std::function<void(PanelRow&, const QList<int>&)> dataChanged);
  ~PanelSection();
  PanelSection(const PanelSection&) = delete;
  PanelSection& operator=(const PanelSection&) = delete;

  [[nodiscard]] QString Name() const { return m_name; }
  [[nodiscard]] QString Key() const { return m_key; }
  [[nodiscard]] VSubjectWarningSummary* Summary() const { return m_model ? m_model->warningSummary() : nullptr; }
  [[nodiscard]] VSortSubjectsProxyModel* Model() const { return m_model; }

  /// The section itself; not there when the model has gone.
  [[nodiscard]] PanelRow& Header() { return m_header; }

  /// A row's index in the model. Invalid for one that it does not have, and within a change, when nobody can say.
  [[nodiscard]] QModelIndex IndexOf(const PanelRow& row) const;

  /// What a search looks through. Only while there is no change under way.
  [[nodiscard]] const QStringList& NamesOf(PanelRow& row) const;

  /// The model is within a change: no update now.
  [[nodiscard]] bool Changing() const { return m_changing > 0; }

  struct News
  {
    bool rowsChanged = false;
    bool tellAll = false;           ///< rows may have answered nothing without being told of
    std::vector<PanelRow*> changed; ///< read again
    std::vector<std::unique_ptr<PanelRow>> gone;
  };
  /// Brings the rows up to date with the model and answers what has changed since the last time. It sorts the model if
  /// that is due, so that what came is told of once, at its place.
  [[nodiscard]] News Update();

private:
  void Follow(VSortSubjectsProxyModel& model);
  void OnDataChanged(const QModelIndex& first, const QModelIndex& last, const QList<int>& roles);
  void OnInserted(const QModelIndex& parent, int first, int last);
  void OnRemoved(const QModelIndex& parent, int first, int last);
  void OnLayoutAboutToChange(QAbstractItemModel::LayoutChangeHint hint);
  void OnLayoutChanged();
  void OnGone();
  void Begin() { ++m_changing; }
  void End();
  /// Ends a change of which it is not known what became of the rows.
  void Replace();

  [[nodiscard]] PanelRow* Find(const QModelIndex& index);
  [[nodiscard]] QModelIndex SourceIndex(const PanelRow& row) const;
  [[nodiscard]] std::vector<PanelRow*> Sortable();
  [[nodiscard]] int SourceRowAt(int row, const QModelIndex& parent) const;
  [[nodiscard]] bool Rearrange(PanelRow& above);
  [[nodiscard]] PanelRow* Make(PanelRow& above, int place);
  void Leave(PanelRow* row);
  void Read(PanelRow& row, const QModelIndex& index) const;
  void ReadNew();
  void List(PanelRow& above);

  const QPointer<VSortSubjectsProxyModel> m_model;
  const QString m_name;
  const QString m_key;
  const std::function<void()> m_changed;
  const std::function<void(PanelRow&, const QList<int>&)> m_dataChanged;
  PanelRow m_header;
  std::unordered_map<const PanelRow*, std::unique_ptr<PanelRow>> m_rows; ///< all but the header
  std::vector<std::unique_ptr<PanelRow>> m_left;
  std::vector<PanelRow*> m_stale;
  std::vector<PanelRow*> m_sorting; ///< whose rows a sort may bring into another order
  struct SortedBy
  {
    int role = 0;
    int column = 0;
    Qt::SortOrder order = Qt::AscendingOrder;
    friend bool operator==(const SortedBy&, const SortedBy&) = default;
  } m_sortedBy;
  bool m_sortDue = false;
  int m_changing = 0;
  bool m_replaced = true; ///< the rows have to be read from the beginning
  bool m_rowsChanged = true;
  mutable bool m_askedInVain = false;
  QObject m_context;
};

}
