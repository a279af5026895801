#include "SubjectStoreUI/PanelFilter.h"

#include <QRegularExpression>

#include <algorithm>
#include <utility>

namespace SubjectStoreUI
{

void PanelFilter::SetSearch(const QString& text)
{
  static const QRegularExpression space(QStringLiteral("\\s+"));
  m_words = text.toCaseFolded().split(space, Qt::SkipEmptyParts);
}

bool PanelFilter::Matches(const PanelSection& section, PanelRow& row) const
{
  const auto holdsAll = [this](const QString& name)
  { return std::all_of(m_words.begin(), m_words.end(), [&](const QString& word) { return name.contains(word); }); };
  const QStringList& names = section.NamesOf(row);
  return std::any_of(names.begin(), names.end(), holdsAll);
}

bool PanelFilter::Judge(const PanelSection& section, PanelRow& subject) const
{
  bool changed = false;
  const auto set = [&changed](auto& value, auto now) { changed = std::exchange(value, now) != now || changed; };
  const bool matches = !Searching() || Matches(section, subject);
  bool holdsMatch = false;
  bool warned = subject.warnings > 0;
  int passing = 0;
  for (PanelRow* row : subject.beneath)
  {
    const bool found = Searching() && Matches(section, *row);
    set(row->passes, matches || found);
    holdsMatch = holdsMatch || found;
    warned = warned || row->warnings > 0;
    passing += row->passes;
  }
  set(subject.holdsMatch, holdsMatch);
  set(subject.passing, passing);
  set(subject.passes, (matches || holdsMatch) && (warned || !m_onlyWarnings));
  return changed;
}

}
