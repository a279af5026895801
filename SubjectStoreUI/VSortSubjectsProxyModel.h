#pragma once

#include "SubjectStoreUI/SubjectTypeGadget.h"
#include "SubjectStoreUI/SubjectsModelRole.h"
#include "SubjectStoreUI/VSubjectWarningSummary.h"

#include <QPointer>
#include <QSortFilterProxyModel>
#include <QTimer>

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace SubjectStoreUI
{

/// What a section of the panel lists, as people sort names: it sorts a model by the text of one role, at every level,
/// and says what the section is of. After rows have come, or texts changed, it sorts once when control is back in the
/// event loop. It does not filter. [gui]
class VSortSubjectsProxyModel : public QSortFilterProxyModel
{
  Q_OBJECT
  /// What the section shows.
  Q_PROPERTY(SubjectStoreUI::VSubjectTypeGadget allowedSubjectType READ allowedSubjectType CONSTANT FINAL)
  /// The section's heading.
  Q_PROPERTY(QString typeDisplayName READ typeDisplayName CONSTANT FINAL)
  Q_PROPERTY(SubjectStoreUI::VSubjectWarningSummary* warningSummary READ warningSummary CONSTANT FINAL)

public:
  /// Keeps `source` alive; the warning summary remains the caller's.
  VSortSubjectsProxyModel(std::shared_ptr<QAbstractItemModel> source, VSubjectTypeGadget allowedSubjectType,
                          QString typeDisplayName, VSubjectWarningSummary* warningSummary,
                          int role = SubjectsModelRole::SubjectProxySortName, QObject* parent = nullptr);

  [[nodiscard]] VSubjectTypeGadget allowedSubjectType() const { return m_allowedSubjectType; }
  [[nodiscard]] QString typeDisplayName() const { return m_typeDisplayName; }
  [[nodiscard]] VSubjectWarningSummary* warningSummary() const { return m_warningSummary; }

  /// Reads each row's text once.
  void sort(int column, Qt::SortOrder order = Qt::AscendingOrder) override;

protected:
  [[nodiscard]] bool lessThan(const QModelIndex& left, const QModelIndex& right) const override;

private:
  /// Where each row of one level belongs among them. A row number and an id together tell a row from those of all
  /// other levels.
  struct Level
  {
    std::vector<quintptr> ids;
    std::vector<int> ranks; ///< the same for the same text

    [[nodiscard]] bool Holds(const QModelIndex& index) const;
  };

  [[nodiscard]] std::string Text(const QModelIndex& index) const;
  [[nodiscard]] Level Rank(const QAbstractItemModel& model, int column, const QModelIndex& parent) const;

  void Follow(QAbstractItemModel& source);
  void Arm();

  const std::shared_ptr<QAbstractItemModel> m_source;
  const VSubjectTypeGadget m_allowedSubjectType;
  const QString m_typeDisplayName;
  const QPointer<VSubjectWarningSummary> m_warningSummary;
  QTimer m_due;
  mutable std::optional<Level> m_level; ///< while it sorts: the level that was compared last
};

}
