#include "SubjectStoreUI/VPanelRowsModel.h"

#include <QThread>

#include <algorithm>
#include <set>
#include <utility>

namespace SubjectStoreUI
{

namespace Own = PanelRowsRole;

namespace
{

bool IsSecondLevel(const PanelRow& row)
{
  return row.kind != EPanelRow::Section && row.kind != EPanelRow::Subject;
}

}

VPanelRowsModel::Section::Section(VPanelRowsModel& owner, VSortSubjectsProxyModel* model, std::size_t at)
    : position(at), mirror(
                        model, [&owner] { owner.RefreshLater(); },
                        [&owner, at](PanelRow& row, const QList<int>& roles) { owner.OnDataChanged(at, row, roles); })
{
}

VPanelRowsModel::VPanelRowsModel(const QList<VSortSubjectsProxyModel*>& sections, QObject* parent)
    : PanelRowList(static_cast<std::size_t>(sections.size()), parent)
{
  m_due.setSingleShot(true);
  m_due.setInterval(0);
  connect(&m_due, &QTimer::timeout, this, [this] { Refresh(); });
  for (VSortSubjectsProxyModel* model : sections)
  {
    const std::size_t position = m_sections.size();
    m_sections.push_back(std::make_unique<Section>(*this, model, position));
    const VSubjectWarningSummary* summary = m_sections.back()->mirror.Summary();
    if (summary == nullptr)
      continue;
    const auto tell = [this, position] { OnSummaryChanged(position); };
    connect(summary, &VSubjectWarningSummary::subjectWarningsChanged, this, tell);
    connect(summary, &QObject::destroyed, this, tell);
  }
  Refresh();
}

VPanelRowsModel::~VPanelRowsModel() = default;

PanelRowList::Place VPanelRowsModel::PlaceOf(const QModelIndex& index) const
{
  return index.isValid() && index.model() == this ? At(index.row()) : Place{};
}

QModelIndex VPanelRowsModel::SourceOf(const QModelIndex& index) const
{
  const Place place = PlaceOf(index);
  return place.row != nullptr ? m_sections[place.section]->mirror.IndexOf(*place.row) : QModelIndex{};
}

QVariant VPanelRowsModel::data(const QModelIndex& index, int role) const
{
  if (role < Own::keys.front().role)
    return SourceOf(index).data(role);
  const Place place = PlaceOf(index);
  return place.row != nullptr ? OwnData(place, role) : QVariant{};
}

QVariant VPanelRowsModel::OwnData(const Place& place, int role) const
{
  const PanelRow& row = *place.row;
  const PanelSection& mirror = m_sections[place.section]->mirror;
  const VSubjectWarningSummary* summary = row.kind == EPanelRow::Section ? mirror.Summary() : nullptr;
  switch (role)
  {
  case Own::RowKind:
    return KindText(row.kind);
  case Own::Section:
    return static_cast<int>(place.section);
  case Own::SectionName:
    return mirror.Name();
  case Own::SectionKey:
    return mirror.Key();
  case Own::Depth:
    return IsSecondLevel(row) ? 2 : row.kind == EPanelRow::Subject ? 1 : 0;
  case Own::Expandable:
    return row.told.expandable;
  case Own::Expanded:
    return row.told.expanded;
  case Own::Count:
    return row.told.count;
  case Own::WarningCount:
    return summary != nullptr ? summary->totalWarningCount() : row.told.warnings;
  case Own::SectionWarnings:
    return summary != nullptr ? summary->subjectWarnings() : QVariantList{};
  case Own::Element:
    return row.told.element;
  case Own::ParentStoreId:
    return QVariant::fromValue(IsSecondLevel(row) ? VStoreIdGadget(row.above->id) : VStoreIdGadget());
  case Own::ParentName:
    return row.told.parentName;
  case Own::MatchCount:
    return row.told.matchCount;
  default:
    return {};
  }
}

bool VPanelRowsModel::setData(const QModelIndex& index, const QVariant& value, int role)
{
  const QModelIndex source = SourceOf(index);
  return source.isValid() && m_sections[At(index.row()).section]->mirror.Model()->setData(source, value, role);
}

Qt::ItemFlags VPanelRowsModel::flags(const QModelIndex& index) const
{
  const Place place = PlaceOf(index);
  if (place.row == nullptr)
    return Qt::NoItemFlags;
  const auto flags = place.row->kind == EPanelRow::Section ? Qt::ItemIsEnabled : SourceOf(index).flags();
  return flags | Qt::ItemNeverHasChildren;
}

QHash<int, QByteArray> VPanelRowsModel::roleNames() const
{
  QHash<int, QByteArray> names = SubjectsModelRole::Names();
  names.insert(RoleNames(Own::keys));
  return names;
}

void VPanelRowsModel::setSearch(const QString& text)
{
  if (text == m_search)
    return;
  m_search = text;
  m_filter.SetSearch(text);
  for (const auto& section : m_sections)
    section->expansion.StartSearch();
  OnFilterChanged();
  Q_EMIT searchChanged();
}

void VPanelRowsModel::setOnlyWarnings(bool on)
{
  if (on == m_filter.OnlyWarnings())
    return;
  m_filter.SetOnlyWarnings(on);
  OnFilterChanged();
  Q_EMIT onlyWarningsChanged();
}

void VPanelRowsModel::OnFilterChanged()
{
  for (const auto& section : m_sections)
    section->judgeDue = true;
  Refresh();
}

void VPanelRowsModel::setExpanded(int row, bool expanded)
{
  const Place place = At(row);
  if (place.row == nullptr || !place.row->there)
    return;
  Section& section = *m_sections[place.section];
  section.expansion.SetOpen(*place.row, expanded);
  section.rowsDue = true;
  Refresh();
}

void VPanelRowsModel::toggle(int row)
{
  if (const Place place = At(row); place.row != nullptr)
    setExpanded(row, !m_sections[place.section]->expansion.IsOpen(*place.row));
}

void VPanelRowsModel::expandAll()
{
  Refresh();
  for (const auto& section : m_sections)
  {
    section->expansion.SetOpen(section->mirror.Header(), true);
    for (const PanelRow* subject : section->mirror.Header().beneath)
      if (!subject->beneath.empty())
        section->expansion.SetOpen(*subject, true);
    section->rowsDue = true;
  }
  Refresh();
}

void VPanelRowsModel::collapseAll()
{
  Refresh();
  for (const auto& section : m_sections)
  {
    section->expansion.SetOpen(section->mirror.Header(), false);
    for (const PanelRow* subject : section->mirror.Header().beneath)
      section->expansion.SetOpen(*subject, false);
    section->expansion.CollapseSubjects();
    section->rowsDue = true;
  }
  Refresh();
}

int VPanelRowsModel::rowOfSubject(const VStoreIdGadget& subject)
{
  Refresh();
  const auto find = [&](const PanelRow& above) -> const PanelRow*
  {
    for (const PanelRow* row : above.beneath)
      if (row->id == subject.Id() && row->passes)
        return row;
    return nullptr;
  };
  if (!subject.Valid())
    return -1;
  for (const auto& section : m_sections)
    if (const PanelRow* row = find(section->mirror.Header()))
      return Reveal(*section, *row);
  for (const auto& section : m_sections)
    for (PanelRow* above : section->mirror.Header().beneath)
      if (const PanelRow* row = above->passes ? find(*above) : nullptr)
        return Reveal(*section, *row);
  return -1;
}

int VPanelRowsModel::Reveal(Section& section, const PanelRow& row)
{
  for (const PanelRow* above = row.above; above != nullptr; above = above->above)
    if (!section.expansion.IsOpen(*above))
    {
      section.expansion.SetOpen(*above, true);
      section.rowsDue = true;
    }
  if (section.rowsDue)
    Refresh();
  return RowOf(section.position, row);
}

int VPanelRowsModel::rowOfSection(const QString& key) const
{
  for (const auto& section : m_sections)
    if (section->mirror.Key() == key && section->mirror.Header().there)
      return RowOf(section->position, section->mirror.Header());
  return -1;
}

QVariantList VPanelRowsModel::subjectsBetween(int first, int last) const
{
  QVariantList subjects;
  std::set<NMX::TSubjectStoreId> seen;
  const int end = std::min(std::max(first, last) + 1, rowCount());
  for (int at = std::max(std::min(first, last), 0); at < end; ++at)
  {
    const PanelRow& row = *At(at).row;
    const bool isSubject = row.kind == EPanelRow::Subject || row.kind == EPanelRow::Child;
    if (isSubject && row.there && row.id.Valid() && seen.insert(row.id).second)
      subjects.append(QVariant::fromValue(VStoreIdGadget(row.id)));
  }
  return subjects;
}

void VPanelRowsModel::OnDataChanged(std::size_t section, const PanelRow& row, const QList<int>& roles)
{
  const int at = RowOf(section, row);
  if (at >= 0)
    Q_EMIT dataChanged(index(at), index(at), roles);
}

void VPanelRowsModel::OnSummaryChanged(std::size_t section)
{
  const int at = RowOf(section, m_sections[section]->mirror.Header());
  if (at >= 0)
    Q_EMIT dataChanged(index(at), index(at), {Own::WarningCount, Own::SectionWarnings});
}

void VPanelRowsModel::RefreshLater()
{
  if (!m_due.isActive())
    m_due.start();
}

void VPanelRowsModel::Refresh()
{
  Q_ASSERT(thread() == QThread::currentThread());
  if (m_refreshing)
    return RefreshLater();
  m_refreshing = true;
  for (const auto& section : m_sections)
    if (!section->mirror.Changing())
      Refresh(*section);
  m_refreshing = false;
  Count();
}

void VPanelRowsModel::Refresh(Section& section)
{
  // What has gone lives on until everybody has been told.
  const PanelSection::News news = section.mirror.Update();
  const std::vector<PanelRow*> touched = Judge(section, news);
  std::vector<Change> changes;
  if (std::exchange(section.rowsDue, false))
  {
    const std::vector<PanelRow*> wanted = Wanted(section);
    for (PanelRow* row : wanted)
      Revalue(section, *row, changes);
    Become(section.position, wanted);
  }
  else
    for (PanelRow* subject : touched)
    {
      Revalue(section, *subject, changes);
      for (PanelRow* row : subject->beneath)
        Revalue(section, *row, changes);
    }
  Tell(section, changes);
  if (const auto& rows = Rows(section.position); news.tellAll && rows.size() > 1)
    Q_EMIT dataChanged(index(RowOf(section.position, *rows[1])), index(RowOf(section.position, *rows.back())));
}

std::vector<PanelRow*> VPanelRowsModel::Judge(Section& section, const PanelSection::News& news)
{
  std::vector<PanelRow*> touched;
  for (PanelRow* row : news.changed)
    if (PanelRow* subject = IsSecondLevel(*row) ? row->above : row; touched.empty() || touched.back() != subject)
      touched.push_back(subject);
  const bool all = std::exchange(section.judgeDue, false) || news.rowsChanged;
  section.rowsDue = section.rowsDue || all;
  for (PanelRow* subject : all ? section.mirror.Header().beneath : touched)
    section.rowsDue = m_filter.Judge(section.mirror, *subject) || section.rowsDue;
  return touched;
}

void VPanelRowsModel::Count()
{
  int total = 0;
  int shown = 0;
  for (const auto& section : m_sections)
  {
    const PanelRow& header = section->mirror.Header();
    total += header.there ? header.told.count : 0;
    shown += header.passing;
  }
  if (total == m_totalCount && shown == m_shownCount)
    return;
  m_totalCount = total;
  m_shownCount = shown;
  Q_EMIT countsChanged();
}

std::vector<PanelRow*> VPanelRowsModel::Wanted(Section& section) const
{
  PanelRow& header = section.mirror.Header();
  header.passing = static_cast<int>(std::count_if(header.beneath.begin(), header.beneath.end(),
                                                  [](const PanelRow* subject) { return subject->passes; }));
  header.holdsMatch = m_filter.Searching() && header.passing > 0;
  if (!header.there)
    return {};
  std::vector<PanelRow*> wanted{&header};
  if (!section.expansion.IsOpen(header))
    return wanted;
  for (PanelRow* subject : header.beneath)
  {
    if (!subject->passes)
      continue;
    wanted.push_back(subject);
    if (!section.expansion.IsOpen(*subject))
      continue;
    for (PanelRow* row : subject->beneath)
      if (row->passes)
        wanted.push_back(row);
  }
  return wanted;
}

PanelRowValues VPanelRowsModel::Values(const Section& section, const PanelRow& row) const
{
  PanelRowValues values;
  values.warnings = row.warnings;
  values.element = row.element;
  values.count = static_cast<int>(row.beneath.size());
  values.matchCount = row.passing;
  values.expandable = values.matchCount > 0;
  values.expanded = section.expansion.IsOpen(row);
  if (IsSecondLevel(row))
    values.parentName = row.above->name;
  return values;
}

void VPanelRowsModel::Revalue(const Section& section, PanelRow& row, std::vector<Change>& changes) const
{
  const PanelRowValues before = std::exchange(row.told, Values(section, row));
  if (row.row < 0)
    return;
  if (QList<int> roles = Differences(before, row.told); !roles.isEmpty())
    changes.push_back({&row, std::move(roles)});
}

void VPanelRowsModel::Tell(const Section& section, const std::vector<Change>& changes)
{
  for (std::size_t first = 0; first < changes.size();)
  {
    const int row = RowOf(section.position, *changes[first].row);
    std::size_t next = first + 1;
    while (next < changes.size() && changes[next].roles == changes[first].roles &&
           RowOf(section.position, *changes[next].row) == row + static_cast<int>(next - first))
      ++next;
    Q_EMIT dataChanged(index(row), index(row + static_cast<int>(next - first) - 1), changes[first].roles);
    first = next;
  }
}

}
