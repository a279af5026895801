#include "SubjectStoreUI/PanelExpansion.h"

namespace SubjectStoreUI
{

bool PanelExpansion::IsOpen(const PanelRow& row) const
{
  if (row.kind == EPanelRow::Section)
    return !m_collapsed || (row.holdsMatch && !m_closed);
  return row.kind == EPanelRow::Subject &&
         (m_expanded.contains(row.id) || (row.holdsMatch && !m_closedSubjects.contains(row.id)));
}

void PanelExpansion::SetOpen(const PanelRow& row, bool open)
{
  if (row.kind == EPanelRow::Section)
    m_collapsed = m_closed = !open;
  else if (row.kind == EPanelRow::Subject && open)
  {
    m_expanded.insert(row.id);
    m_closedSubjects.erase(row.id);
  }
  else if (row.kind == EPanelRow::Subject)
  {
    m_expanded.erase(row.id);
    m_closedSubjects.insert(row.id);
  }
}

void PanelExpansion::StartSearch()
{
  m_closed = false;
  m_closedSubjects.clear();
}

}
