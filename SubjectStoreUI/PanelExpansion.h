#pragma once

#include "SubjectStoreUI/PanelRow.h"

#include <set>

namespace SubjectStoreUI
{

/// What is open in a section: what somebody has expanded, by the ids of the subjects, whether they are there or not,
/// and what a search opens by itself. [gui]
class PanelExpansion
{
public:
  [[nodiscard]] bool IsOpen(const PanelRow& row) const;
  /// Of a section or a subject. What is closed here stays closed until the next search.
  void SetOpen(const PanelRow& row, bool open);
  void CollapseSubjects() { m_expanded.clear(); }
  void StartSearch();

private:
  bool m_collapsed = false;
  std::set<NMX::TSubjectStoreId> m_expanded;
  // Closed although a search finds something beneath.
  bool m_closed = false;
  std::set<NMX::TSubjectStoreId> m_closedSubjects;
};

}
