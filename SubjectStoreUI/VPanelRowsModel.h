#pragma once

#include "SubjectStoreUI/PanelExpansion.h"
#include "SubjectStoreUI/PanelFilter.h"
#include "SubjectStoreUI/PanelRowList.h"
#include "SubjectStoreUI/PanelRowsRole.h"
#include "SubjectStoreUI/PanelSection.h"
#include "SubjectStoreUI/SubjectGadgets.h"
#include "SubjectStoreUI/VSortSubjectsProxyModel.h"

#include <QString>
#include <QTimer>
#include <QVariantList>

#include <cstddef>
#include <memory>
#include <vector>

namespace SubjectStoreUI
{

/// The sections of the panel as the flat list that one view shows: a header for each section, its subjects beneath an
/// expanded one, and beneath an expanded subject its children or slots and its elements. Sections start expanded and
/// subjects collapsed; what is expanded is remembered by the subjects' ids, also while they are away.
///
/// A changed value is told of at once. Rows that come, go or move are told of together when control is back in the
/// event loop, or when somebody expands, filters or looks for a row: a burst is one change for the view, and thousands
/// of rows that arrive one by one cost a pass over the list, not thousands. Until then a row of something that has gone
/// answers nothing of it. It never resets. [gui]
class VPanelRowsModel : public PanelRowList
{
  Q_OBJECT
  /// What subjects, or anything beneath them, must have in a name to be shown: every word, in whatever case. What holds
  /// something that is found opens for as long as it is searched for.
  Q_PROPERTY(QString search READ search WRITE setSearch NOTIFY searchChanged FINAL)
  /// Only subjects are shown that have warnings, or something with warnings beneath them.
  Q_PROPERTY(bool onlyWarnings READ onlyWarnings WRITE setOnlyWarnings NOTIFY onlyWarningsChanged FINAL)
  /// The subjects of all sections, and how many of them the search and the filter let through.
  Q_PROPERTY(int totalCount READ totalCount NOTIFY countsChanged FINAL)
  Q_PROPERTY(int shownCount READ shownCount NOTIFY countsChanged FINAL)

public:
  /// The sections remain the caller's. One that is destroyed has no rows any more.
  explicit VPanelRowsModel(const QList<VSortSubjectsProxyModel*>& sections, QObject* parent = nullptr);
  ~VPanelRowsModel() override;

  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;
  /// As the section does; headers cannot be edited.
  bool setData(const QModelIndex& index, const QVariant& value, int role) override;
  [[nodiscard]] Qt::ItemFlags flags(const QModelIndex& index) const override;
  [[nodiscard]] QHash<int, QByteArray> roleNames() const override;

  [[nodiscard]] QString search() const { return m_search; }
  void setSearch(const QString& text);
  [[nodiscard]] bool onlyWarnings() const { return m_filter.OnlyWarnings(); }
  void setOnlyWarnings(bool on);
  [[nodiscard]] int totalCount() const { return m_totalCount; }
  [[nodiscard]] int shownCount() const { return m_shownCount; }

  /// Expands or collapses a section or a subject. What a search has opened can be collapsed for that search.
  Q_INVOKABLE void setExpanded(int row, bool expanded);
  Q_INVOKABLE void toggle(int row);
  /// All sections, and all subjects that are there and have something beneath them.
  Q_INVOKABLE void expandAll();
  /// All sections and all subjects, also those that are away.
  Q_INVOKABLE void collapseAll();

  /// The row of a subject, or else the first row beneath another subject that it is shown in, after opening what is
  /// above it. -1 when there is none, or the search or the filter hides it.
  Q_INVOKABLE int rowOfSubject(const SubjectStoreUI::VStoreIdGadget& subject);
  /// The row of the section with that key; -1 when there is none.
  Q_INVOKABLE [[nodiscard]] int rowOfSection(const QString& key) const;
  /// VStoreIdGadget of the subjects and children in these two rows and between them, each once, from the top. The rows
  /// may come in either order.
  Q_INVOKABLE [[nodiscard]] QVariantList subjectsBetween(int first, int last) const;

Q_SIGNALS:
  void searchChanged();
  void onlyWarningsChanged();
  void countsChanged();

private:
  /// A section, and what is open in it.
  struct Section
  {
    Section(VPanelRowsModel& owner, VSortSubjectsProxyModel* model, std::size_t position);

    const std::size_t position;
    PanelSection mirror;
    PanelExpansion expansion;
    bool judgeDue = true;
    bool rowsDue = true;
  };

  struct Change
  {
    PanelRow* row;
    QList<int> roles;
  };

  [[nodiscard]] Place PlaceOf(const QModelIndex& index) const;
  [[nodiscard]] QVariant OwnData(const Place& place, int role) const;
  [[nodiscard]] QModelIndex SourceOf(const QModelIndex& index) const;

  /// The list's number of a row, after opening what is above it.
  [[nodiscard]] int Reveal(Section& section, const PanelRow& row);

  void OnDataChanged(std::size_t section, const PanelRow& row, const QList<int>& roles);
  void OnSummaryChanged(std::size_t section);
  void OnFilterChanged();

  /// Brings the list up to date with the sections; later when it is being changed already.
  void Refresh();
  void RefreshLater();
  void Refresh(Section& section);
  /// Judges what may be judged otherwise now. Answers the subjects of what was read again.
  std::vector<PanelRow*> Judge(Section& section, const PanelSection::News& news);
  void Count();
  [[nodiscard]] std::vector<PanelRow*> Wanted(Section& section) const;
  [[nodiscard]] PanelRowValues Values(const Section& section, const PanelRow& row) const;
  /// Takes over what the list says of a row now. When the row is shown already, what is new in it is a change.
  void Revalue(const Section& section, PanelRow& row, std::vector<Change>& changes) const;
  void Tell(const Section& section, const std::vector<Change>& changes);

  std::vector<std::unique_ptr<Section>> m_sections;
  PanelFilter m_filter;
  QString m_search;
  int m_totalCount = 0;
  int m_shownCount = 0;
  bool m_refreshing = false;
  QTimer m_due;
};

}
