#pragma once

#include "SubjectStoreUI/SubjectsModelRole.h"

namespace SubjectStoreUI::PanelRowsRole
{

/// What VPanelRowsModel tells of a row beside SubjectsModelRole.
enum ERole : int
{
  RowKind = 300, ///< "section", "subject", "child", "slot" or "element"
  Section,       ///< the position of its section
  SectionName,
  SectionKey, ///< the key of the section's kind, such as "BasicObjects"
  Depth,      ///< 0 for a section, 1 for a subject, 2 for what is beneath a subject
  Expandable, ///< there is something to show beneath it
  Expanded,
  Count,           ///< of a section its subjects, of a subject the rows beneath it, whether they are shown or not
  WarningCount,    ///< of a section as its summary counts them, else how many kinds of warning the row's subject has
  SectionWarnings, ///< of a section: its summary's sentences, a list of VWarningGadget
  Element,         ///< the position among the clusters, or among the markers, of the subject above; -1 for other rows
  ParentStoreId,   ///< VStoreIdGadget of the subject above; the invalid id where there is none
  ParentName,
  MatchCount ///< as Count, of those only that the search and the filter let through
};

struct Key
{
  ERole role;
  std::string_view text;
};

/// Every role with its key, in ascending order.
inline constexpr std::array keys{Key{RowKind, "RowKind"},
                                 Key{Section, "Section"},
                                 Key{SectionName, "SectionName"},
                                 Key{SectionKey, "SectionKey"},
                                 Key{Depth, "Depth"},
                                 Key{Expandable, "Expandable"},
                                 Key{Expanded, "Expanded"},
                                 Key{Count, "Count"},
                                 Key{WarningCount, "WarningCount"},
                                 Key{SectionWarnings, "SectionWarnings"},
                                 Key{Element, "Element"},
                                 Key{ParentStoreId, "ParentStoreId"},
                                 Key{ParentName, "ParentName"},
                                 Key{MatchCount, "MatchCount"}};

static_assert(keys.front().role == 300 && keys.back().role == 313);

}
