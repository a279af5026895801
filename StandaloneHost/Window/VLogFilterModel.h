#pragma once

#include "StandaloneHost/Window/VLogModel.h"

#include <QSortFilterProxyModel>

namespace Window
{

/// The messages of the log that somebody wants to see. [gui]
class VLogFilterModel final : public QSortFilterProxyModel
{
  Q_OBJECT
  /// Empty for all channels.
  Q_PROPERTY(QString channel READ Channel WRITE SetChannel NOTIFY filterChanged)
  /// Number of NMX::ESeverity; only what is as grave as that is shown.
  Q_PROPERTY(int severity READ Severity WRITE SetSeverity NOTIFY filterChanged)

public:
  explicit VLogFilterModel(VLogModel& log, QObject* parent = nullptr);

  [[nodiscard]] QString Channel() const { return m_channel; }
  [[nodiscard]] int Severity() const { return m_severity; }
  void SetChannel(const QString& channel);
  void SetSeverity(int severity);

  /// The messages of these rows, both included, one per line. Rows that are not there are left out.
  Q_INVOKABLE [[nodiscard]] QString lines(int first, int last) const;

Q_SIGNALS:
  void filterChanged();

protected:
  [[nodiscard]] bool filterAcceptsRow(int sourceRow, const QModelIndex& sourceParent) const override;

private:
  QString m_channel;
  int m_severity = static_cast<int>(NMX::ESeverity::Trace);
};

}
