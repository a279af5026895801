#include "StandaloneHost/Window/VLogFilterModel.h"

#include <algorithm>

namespace Window
{

VLogFilterModel::VLogFilterModel(VLogModel& log, QObject* parent) : QSortFilterProxyModel(parent)
{
  setSourceModel(&log);
}

void VLogFilterModel::SetChannel(const QString& channel)
{
  if (channel == m_channel)
    return;
  m_channel = channel;
  invalidateFilter();
  Q_EMIT filterChanged();
}

void VLogFilterModel::SetSeverity(int severity)
{
  if (severity == m_severity)
    return;
  m_severity = severity;
  invalidateFilter();
  Q_EMIT filterChanged();
}

QString VLogFilterModel::lines(int first, int last) const
{
  QString text;
  for (int row = std::max(first, 0); row <= std::min(last, rowCount() - 1); ++row)
  {
    const QModelIndex line = index(row, 0);
    text += QString("%1 %2 [%3] %4\n")
                .arg(line.data(VLogModel::Time).toString(), line.data(VLogModel::SeverityName).toString(),
                     line.data(VLogModel::Channel).toString(), line.data(VLogModel::Text).toString());
  }
  return text;
}

bool VLogFilterModel::filterAcceptsRow(int sourceRow, const QModelIndex& sourceParent) const
{
  const QModelIndex line = sourceModel()->index(sourceRow, 0, sourceParent);
  return line.data(VLogModel::Severity).toInt() <= m_severity &&
         (m_channel.isEmpty() || line.data(VLogModel::Channel).toString() == m_channel);
}

}
