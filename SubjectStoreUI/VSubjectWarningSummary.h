#pragma once

#include <QObject>
#include <QVariantList>

#include <map>

namespace SubjectStoreUI
{

/// Says above a section of the panel which warnings its subjects carry: one sentence per warning type. [gui]
class VSubjectWarningSummary final : public QObject
{
  Q_OBJECT
  /// Of VWarningGadget: the top-level subjects' sentences first, then their children's, each in the order of the ids.
  Q_PROPERTY(QVariantList subjectWarnings READ subjectWarnings NOTIFY subjectWarningsChanged FINAL)
  /// The sum of the counts in the sentences.
  Q_PROPERTY(int totalWarningCount READ totalWarningCount NOTIFY subjectWarningsChanged FINAL)

public:
  using QObject::QObject;

  [[nodiscard]] QVariantList subjectWarnings() const { return m_warnings; }
  [[nodiscard]] int totalWarningCount() const { return m_total; }

  /// How many warnings there are now by type id, of the top-level subjects and of their children. A type that occurs
  /// in both has two sentences, one without a sentence is not counted.
  void update(const std::map<int, int>& topLevel, const std::map<int, int>& children);

Q_SIGNALS:
  void subjectWarningsChanged();

private:
  QVariantList m_warnings;
  int m_total = 0;
};

}
