#include "SubjectStoreUI/PanelRow.h"

#include "SubjectStoreUI/PanelRowsRole.h"

namespace SubjectStoreUI
{

namespace Own = PanelRowsRole;

QString KindText(EPanelRow kind)
{
  switch (kind)
  {
  case EPanelRow::Section:
    return QStringLiteral("section");
  case EPanelRow::Subject:
    return QStringLiteral("subject");
  case EPanelRow::Child:
    return QStringLiteral("child");
  case EPanelRow::Slot:
    return QStringLiteral("slot");
  case EPanelRow::Element:
    return QStringLiteral("element");
  }
  return {};
}

QList<int> Differences(const PanelRowValues& before, const PanelRowValues& now)
{
  QList<int> roles;
  const auto compare = [&](auto value, int role)
  {
    if (before.*value != now.*value)
      roles.append(role);
  };
  compare(&PanelRowValues::expandable, Own::Expandable);
  compare(&PanelRowValues::expanded, Own::Expanded);
  compare(&PanelRowValues::count, Own::Count);
  compare(&PanelRowValues::warnings, Own::WarningCount);
  compare(&PanelRowValues::element, Own::Element);
  compare(&PanelRowValues::parentName, Own::ParentName);
  compare(&PanelRowValues::matchCount, Own::MatchCount);
  return roles;
}

}
