#pragma once

#include "SubjectStoreUI/ISubjectModelInternalData.h"
#include "SubjectStoreUI/VSortSubjectsProxyModel.h"
#include "SubjectStoreUI/VSubjectModelStoreBase.h"
#include "SubjectStoreUI/VSubjectWarningSummary.h"

#include <QObject>

#include <memory>

namespace SubjectStoreUI
{

/// One section of the panel: the subjects of one kind, what is beneath them, sorted, and the section's warnings. It
/// follows the store. [gui]
class SubjectSection final : public QObject
{
  Q_OBJECT

public:
  SubjectSection(const std::shared_ptr<ISubjectModelInternalData>& data, NMX::ESubjectKind kind,
                 int intervalInMilliseconds);
  ~SubjectSection() override;

  [[nodiscard]] VSortSubjectsProxyModel& Model() const { return *m_sorted; }

private:
  /// Element models leave when the model of subjects is reset, and come back here.
  void AttachElements();

  const std::shared_ptr<ISubjectModelInternalData> m_data;
  const bool m_hasElements;
  VSubjectWarningSummary m_summary;
  std::shared_ptr<VSubjectModelStoreBase> m_tree;
  std::unique_ptr<VSortSubjectsProxyModel> m_sorted;
};

}
