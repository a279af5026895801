#pragma once

#include "SubjectStoreUI/PanelSection.h"

#include <QStringList>

namespace SubjectStoreUI
{

/// Which rows the panel shows: those that are searched for, and those of subjects with warnings. [gui]
class PanelFilter
{
public:
  /// The words that a name has to contain, all of them, in whatever case. Without words everything passes.
  void SetSearch(const QString& text);
  void SetOnlyWarnings(bool on) { m_onlyWarnings = on; }

  [[nodiscard]] bool Searching() const { return !m_words.isEmpty(); }
  [[nodiscard]] bool OnlyWarnings() const { return m_onlyWarnings; }

  /// Judges a subject and what is beneath it. Answers whether something is judged otherwise than before.
  [[nodiscard]] bool Judge(const PanelSection& section, PanelRow& subject) const;

private:
  [[nodiscard]] bool Matches(const PanelSection& section, PanelRow& row) const;

  QStringList m_words;
  bool m_onlyWarnings = false;
};

}
