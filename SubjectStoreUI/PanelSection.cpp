#include "SubjectStoreUI/PanelSection.h"

#include "SubjectStoreUI/SubjectGadgets.h"

#include <algorithm>
#include <iterator>
#include <map>
#include <tuple>
#include <utility>

namespace SubjectStoreUI
{

namespace Role = SubjectsModelRole;

namespace
{

constexpr int readRoles[] = {Role::SubjectStoreId,
                             Role::SubjectName,
                             Role::SubjectWarnings,
                             Role::SubjectSlotName,
                             Role::SubjectSmartClusterDeviceNames,
                             Role::SubjectSmartAndBasicMarkers};

bool Reread(const QList<int>& roles)
{
  return roles.isEmpty() ||
         std::any_of(std::begin(readRoles), std::end(readRoles), [&](int role) { return roles.contains(role); });
}

/// Tells a row from its siblings, except from those that nothing tells it from.
auto KeyOf(const PanelRow& row)
{
  return std::tuple(row.kind, row.marker, row.id.Value());
}

std::size_t At(int place)
{
  return static_cast<std::size_t>(place);
}

/// What a subject's rows beneath are in relation to one another.
void Survey(PanelRow& subject)
{
  int clusters = 0;
  int markers = 0;
  subject.holdsChild = false;
  for (PanelRow* row : subject.beneath)
  {
    if (row->kind == EPanelRow::Element)
      row->element = row->marker ? markers++ : clusters++;
    subject.holdsChild = subject.holdsChild || row->kind == EPanelRow::Child;
  }
}

}

PanelSection::PanelSection(VSortSubjectsProxyModel* model, std::function<void()> changed,
                           std::function<void(PanelRow&, const QList<int>&)> dataChanged)
    : m_model(model), m_name(model != nullptr ? model->typeDisplayName() : QString()),
      m_key(model != nullptr ? model->allowedSubjectType().Key() : QString()), m_changed(std::move(changed)),
      m_dataChanged(std::move(dataChanged))
{
  m_header.kind = EPanelRow::Section;
  m_header.there = model != nullptr;
  m_header.read = true;
  if (model != nullptr)
  {
    m_sortedBy = {model->sortRole(), model->sortColumn(), model->sortOrder()};
    Follow(*model);
  }
}

PanelSection::~PanelSection() = default;

void PanelSection::Follow(VSortSubjectsProxyModel& model)
{
  using M = QAbstractItemModel;
  const auto begin = [this] { Begin(); };
  const auto replace = [this] { Replace(); };
  const auto on = [&](auto signal, auto slot) { QObject::connect(&model, signal, &m_context, slot); };
  on(&M::dataChanged, [this](const QModelIndex& first, const QModelIndex& last, const QList<int>& roles)
     { OnDataChanged(first, last, roles); });
  on(&M::rowsAboutToBeInserted, begin);
  on(&M::rowsInserted, [this](const QModelIndex& parent, int first, int last) { OnInserted(parent, first, last); });
  on(&M::rowsAboutToBeRemoved, begin);
  on(&M::rowsRemoved, [this](const QModelIndex& parent, int first, int last) { OnRemoved(parent, first, last); });
  on(&M::rowsAboutToBeMoved, begin);
  on(&M::rowsMoved, replace);
  on(&M::modelAboutToBeReset, begin);
  on(&M::modelReset, replace);
  on(&M::layoutAboutToBeChanged,
     [this](const auto&, QAbstractItemModel::LayoutChangeHint hint) { OnLayoutAboutToChange(hint); });
  on(&M::layoutChanged, [this] { OnLayoutChanged(); });
  on(&QObject::destroyed, [this] { OnGone(); });
}

QModelIndex PanelSection::IndexOf(const PanelRow& row) const
{
  if (!row.there || row.kind == EPanelRow::Section)
    return {};
  if (m_changing == 0 && !m_replaced)
    return SourceIndex(row);
  m_askedInVain = true;
  return {};
}

QModelIndex PanelSection::SourceIndex(const PanelRow& row) const
{
  if (!m_model || row.above == nullptr)
    return {};
  const auto& siblings = row.above->beneath;
  if (At(row.place) >= siblings.size() || siblings[At(row.place)] != &row)
    for (std::size_t place = 0; place < siblings.size(); ++place)
      siblings[place]->place = static_cast<int>(place);
  return m_model->index(row.place, 0, SourceIndex(*row.above));
}

const QStringList& PanelSection::NamesOf(PanelRow& row) const
{
  if (row.names)
    return *row.names;
  QStringList& names = row.names.emplace(row.name.toCaseFolded());
  if (row.kind == EPanelRow::Slot)
    names << SourceIndex(row).data(Role::SubjectSlotName).toString().toCaseFolded();
  if (row.kind == EPanelRow::Element)
    for (const QString& device : SourceIndex(row).data(Role::SubjectSmartClusterDeviceNames).toStringList())
      names << device.toCaseFolded();
  return names;
}

PanelRow* PanelSection::Find(const QModelIndex& index)
{
  if (m_replaced)
    return nullptr;
  if (!index.isValid())
    return &m_header;
  const PanelRow* above = Find(index.parent());
  return above != nullptr && At(index.row()) < above->beneath.size() ? above->beneath[At(index.row())] : nullptr;
}

void PanelSection::Replace()
{
  m_replaced = true;
  End();
}

void PanelSection::End()
{
  m_changing = std::max(m_changing - 1, 0);
  m_changed();
}

void PanelSection::OnDataChanged(const QModelIndex& first, const QModelIndex& last, const QList<int>& roles)
{
  PanelRow* above = Find(first.parent());
  if (!first.isValid() || above == nullptr)
    return;
  const bool reread = Reread(roles);
  if (m_model && (roles.isEmpty() || roles.contains(m_model->sortRole())))
    above->unsorted = m_sortDue = true;
  if (reread || m_sortDue)
    m_changed();
  // Whoever hears of a row may edit, and the others may have gone then.
  std::vector<PanelRow*> rows;
  for (int place = first.row(); place <= last.row() && At(place) < above->beneath.size(); ++place)
  {
    PanelRow& row = *above->beneath[At(place)];
    rows.push_back(&row);
    row.place = place;
    if (!reread || !row.read || std::exchange(row.stale, true))
      continue;
    row.names.reset();
    m_stale.push_back(&row);
  }
  for (PanelRow* row : rows)
    if (m_rows.contains(row))
      m_dataChanged(*row, roles);
}

void PanelSection::OnInserted(const QModelIndex& parent, int first, int last)
{
  if (PanelRow* above = Find(parent); above != nullptr && above->listed)
  {
    if (At(first) > above->beneath.size())
      return Replace();
    std::vector<PanelRow*> rows;
    for (int place = first; place <= last; ++place)
      rows.push_back(Make(*above, place));
    above->beneath.insert(above->beneath.begin() + first, rows.begin(), rows.end());
    above->unsorted = m_sortDue = true;
    m_rowsChanged = true;
  }
  End();
}

void PanelSection::OnRemoved(const QModelIndex& parent, int first, int last)
{
  if (PanelRow* above = Find(parent); above != nullptr && above->listed)
  {
    if (At(last) >= above->beneath.size())
      return Replace();
    const auto begin = above->beneath.begin() + first;
    const auto end = above->beneath.begin() + last + 1;
    std::for_each(begin, end, [this](PanelRow* row) { Leave(row); });
    above->beneath.erase(begin, end);
    m_rowsChanged = true;
  }
  End();
}

/// The lists whose order a sort may change. To ask the model where rows come from is dear, so those are left out that
/// were sorted and are sorted by the numbers of their rows, as slots and elements are. Names may have changed already
/// without a word.
std::vector<PanelRow*> PanelSection::Sortable()
{
  const SortedBy now{m_model->sortRole(), m_model->sortColumn(), m_model->sortOrder()};
  const bool all = std::exchange(m_sortedBy, now) != now || m_model->sortRole() != Role::SubjectProxySortName;
  std::vector<PanelRow*> lists{&m_header};
  for (PanelRow* subject : m_header.beneath)
    if (subject->listed && subject->beneath.size() > 1 && (all || subject->unsorted || subject->holdsChild))
      lists.push_back(subject);
  return lists;
}

int PanelSection::SourceRowAt(int row, const QModelIndex& parent) const
{
  return m_model->mapToSource(m_model->index(row, 0, parent)).row();
}

void PanelSection::OnLayoutAboutToChange(QAbstractItemModel::LayoutChangeHint hint)
{
  Begin();
  if (!m_model || m_replaced)
    return;
  // A sort leaves the rows of the model beneath where they are. Of another change that is not known.
  if (hint != QAbstractItemModel::VerticalSortHint)
  {
    m_replaced = true;
    return;
  }
  m_sorting = Sortable();
  for (PanelRow* above : m_sorting)
  {
    const QModelIndex parent = SourceIndex(*above);
    for (std::size_t place = 0; place < above->beneath.size(); ++place)
      above->beneath[place]->sourceRow = SourceRowAt(static_cast<int>(place), parent);
  }
}

void PanelSection::OnLayoutChanged()
{
  m_sortDue = false;
  for (PanelRow* above : std::exchange(m_sorting, {}))
  {
    above->unsorted = false;
    if (m_model && !m_replaced && !Rearrange(*above))
      m_replaced = true;
  }
  End();
}

/// Brings rows into the model's order by the rows that they have beneath it. False when they are not the same.
bool PanelSection::Rearrange(PanelRow& above)
{
  const QModelIndex parent = SourceIndex(above);
  const std::size_t count = above.beneath.size();
  if (m_model->rowCount(parent) != static_cast<int>(count))
    return false;
  std::vector<std::size_t> placeBySource(count, count);
  for (std::size_t place = 0; place < count; ++place)
    if (const std::size_t source = At(above.beneath[place]->sourceRow); source < count)
      placeBySource[source] = place;
  std::vector<std::size_t> order;
  for (std::size_t place = 0; place < count; ++place)
  {
    const std::size_t source = At(SourceRowAt(static_cast<int>(place), parent));
    if (source >= count || placeBySource[source] == count)
      return false;
    order.push_back(std::exchange(placeBySource[source], count));
  }
  if (std::is_sorted(order.begin(), order.end()))
    return true;
  std::vector<PanelRow*> rows;
  for (const std::size_t place : order)
  {
    rows.push_back(above.beneath[place]);
    rows.back()->place = static_cast<int>(rows.size()) - 1;
  }
  above.beneath = std::move(rows);
  m_rowsChanged = true;
  return true;
}

void PanelSection::OnGone()
{
  for (PanelRow* row : std::exchange(m_header.beneath, {}))
    Leave(row);
  m_header.there = false;
  m_replaced = false;
  m_rowsChanged = true;
  m_changing = 1;
  End();
}

PanelRow* PanelSection::Make(PanelRow& above, int place)
{
  auto row = std::make_unique<PanelRow>();
  row->above = &above;
  row->place = place;
  PanelRow* made = row.get();
  m_rows.emplace(made, std::move(row));
  return made;
}

/// It and what is beneath it are kept until whoever shows them knows.
void PanelSection::Leave(PanelRow* row)
{
  row->there = false;
  for (PanelRow* beneath : row->beneath)
    Leave(beneath);
  m_left.push_back(std::move(m_rows.extract(row).mapped()));
}

PanelSection::News PanelSection::Update()
{
  if (std::exchange(m_sortDue, false) && m_model && !m_replaced)
    m_model->sort(m_model->sortColumn(), m_model->sortOrder());
  News news;
  const bool replaced = std::exchange(m_replaced, false);
  news.tellAll = std::exchange(m_askedInVain, false) || replaced;
  news.rowsChanged = std::exchange(m_rowsChanged, false) || replaced;
  if (replaced && m_model)
    List(m_header);
  else if (news.rowsChanged)
    ReadNew();
  news.gone = std::exchange(m_left, {});
  for (PanelRow* row : std::exchange(m_stale, {}))
  {
    row->stale = false;
    if (!row->there)
      continue;
    Read(*row, SourceIndex(*row));
    Survey(*row->above);
    news.changed.push_back(row);
  }
  return news;
}

void PanelSection::Read(PanelRow& row, const QModelIndex& index) const
{
  row.read = true;
  if (row.above != &m_header)
  {
    // The trees say of children, too, that they are slots.
    row.kind = index.data(Role::SubjectIsSubjectElement).toBool() ? EPanelRow::Element
               : index.data(Role::SubjectSlotName).isValid()      ? EPanelRow::Slot
                                                                  : EPanelRow::Child;
  }
  row.name = index.data(Role::SubjectName).toString();
  if (row.kind == EPanelRow::Element)
  {
    row.marker = index.data(Role::SubjectSmartAndBasicMarkers).isValid();
    return;
  }
  row.id = index.data(Role::SubjectStoreId).value<VStoreIdGadget>().Id();
  row.warnings = static_cast<int>(index.data(Role::SubjectWarnings).toList().size());
}

void PanelSection::ReadNew()
{
  for (PanelRow* subject : m_header.beneath)
  {
    if (!subject->read)
      Read(*subject, SourceIndex(*subject));
    if (!subject->listed)
      List(*subject);
    for (PanelRow* row : subject->beneath)
      if (!row->read)
        Read(*row, SourceIndex(*row));
    Survey(*subject);
  }
}

/// Reads the rows beneath one from the beginning. Those that can be recognised stay.
void PanelSection::List(PanelRow& above)
{
  std::multimap<decltype(KeyOf(above)), PanelRow*> known;
  for (PanelRow* row : std::exchange(above.beneath, {}))
    known.emplace(KeyOf(*row), row);
  above.listed = true;
  const QModelIndex parent = SourceIndex(above);
  const int count = m_model->rowCount(parent);
  for (int place = 0; place < count; ++place)
  {
    PanelRow* row = Make(above, place);
    const QModelIndex index = m_model->index(place, 0, parent);
    Read(*row, index);
    if (const auto found = known.lower_bound(KeyOf(*row)); found != known.end() && found->first == KeyOf(*row))
    {
      m_rows.erase(row);
      row = found->second;
      known.erase(found);
      row->place = place;
      row->names.reset();
      Read(*row, index);
    }
    above.beneath.push_back(row);
    if (&above == &m_header)
      List(*row);
  }
  for (const auto& [key, row] : known)
    Leave(row);
  Survey(above);
}

}
