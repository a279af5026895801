#include "SubjectStoreUI/VSubjectWarningSummary.h"

#include "SubjectStoreUI/WarningGadget.h"
#include "SubjectStoreUI/WarningTypes.h"

#include <utility>

namespace SubjectStoreUI
{

namespace
{

QString Sentence(std::string_view form, int count)
{
  const QString ending = count == 1 ? QStringLiteral(" has") : QStringLiteral("s have");
  return QString::fromUtf8(form.data(), static_cast<qsizetype>(form.size())).arg(QString::number(count), ending);
}

}

void VSubjectWarningSummary::update(const std::map<int, int>& topLevel, const std::map<int, int>& children)
{
  QVariantList warnings;
  int total = 0;
  for (const auto* counts : {&topLevel, &children})
    for (const auto& [typeId, count] : *counts)
    {
      const std::string_view form = WarningSentence(typeId);
      if (form.empty() || count <= 0)
        continue;
      warnings.append(QVariant::fromValue(VWarningGadget{typeId, Sentence(form, count)}));
      total += count;
    }

  if (warnings == m_warnings)
    return;
  m_warnings = std::move(warnings);
  m_total = total;
  Q_EMIT subjectWarningsChanged();
}

}
