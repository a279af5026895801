#pragma once

#include "HostInterface/NMX/ITypedId.h"

#include <QList>
#include <QString>
#include <QStringList>

#include <cstddef>
#include <optional>
#include <vector>

namespace SubjectStoreUI
{

/// What a row of the panel's list is. The last three are what lies beneath a subject.
enum class EPanelRow
{
  Section,
  Subject,
  Child,
  Slot,
  Element
};

/// The kind as QML knows it.
[[nodiscard]] QString KindText(EPanelRow kind);

/// What the list itself says of a row.
struct PanelRowValues
{
  bool expandable = false;
  bool expanded = false;
  int count = 0;
  int matchCount = 0;
  int warnings = 0; ///< not of a section
  int element = -1;
  QString parentName;
};

/// The roles in which they differ.
[[nodiscard]] QList<int> Differences(const PanelRowValues& before, const PanelRowValues& now);

/// A row of a section, whether the list shows it or not. It stays at its address for as long as somebody may ask for
/// it, also when the section's model has it no more.
struct PanelRow
{
  EPanelRow kind = EPanelRow::Subject;
  PanelRow* above = nullptr; ///< null for a section
  std::vector<PanelRow*> beneath;

  // What PanelSection knows of it.
  bool there = true;     ///< the section's model has it
  bool read = false;     ///< what follows is known
  bool stale = false;    ///< it has to be read again
  bool listed = false;   ///< `beneath` is known
  bool unsorted = false; ///< something beneath has come, or has another text, since the last sort
  bool holdsChild = false;
  bool marker = false;
  NMX::TSubjectStoreId id;
  QString name;
  int warnings = 0;
  int element = -1;
  std::optional<QStringList> names; ///< what a search looks through, with the case folded
  mutable int place = 0;            ///< among its siblings, unless they have changed since
  int sourceRow = 0;                ///< while the section sorts

  // What PanelFilter thinks of it.
  bool passes = true;      ///< not of a section
  bool holdsMatch = false; ///< a search finds something beneath it
  int passing = 0;         ///< how many rows beneath pass

  // What VPanelRowsModel shows of it.
  PanelRowValues told;
  int wanted = -1; ///< while the list changes
  int row = -1;    ///< in its section, unless others have come or gone since; -1 while it is not shown
};

}
