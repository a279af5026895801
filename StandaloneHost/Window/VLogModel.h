#pragma once

#include "HostInterface/NMX/GlobalLog.h"

#include <QAbstractListModel>
#include <QStringList>

#include <cstddef>
#include <deque>
#include <mutex>

namespace Window
{

/// The newest messages of the log, the oldest first. [gui]
class VLogModel final : public QAbstractListModel
{
  Q_OBJECT
  /// Since the program started; not only of those that are still here.
  Q_PROPERTY(int warnings READ Warnings NOTIFY countsChanged)
  Q_PROPERTY(int errors READ Errors NOTIFY countsChanged)
  /// The channels that have said something, in alphabetical order.
  Q_PROPERTY(QStringList channels READ Channels NOTIFY channelsChanged)

public:
  enum Role
  {
    Time = Qt::UserRole, ///< text, to the millisecond
    Severity,            ///< number of NMX::ESeverity
    SeverityName,
    Channel,
    Text
  };

  static constexpr std::size_t capacity = 5000;

  explicit VLogModel(QObject* parent = nullptr) : QAbstractListModel(parent) {}

  /// The model shows it once the event loop gets there. Does not log. [any]
  void Append(const NMX::LogRecord& record);

  [[nodiscard]] int Warnings() const { return m_warnings; }
  [[nodiscard]] int Errors() const { return m_errors; }
  [[nodiscard]] QStringList Channels() const { return m_channels; }

  [[nodiscard]] int rowCount(const QModelIndex& parent = {}) const override;
  [[nodiscard]] QVariant data(const QModelIndex& index, int role) const override;
  [[nodiscard]] QHash<int, QByteArray> roleNames() const override;

Q_SIGNALS:
  void countsChanged();
  void channelsChanged();

private:
  struct Message
  {
    qint64 time; ///< in ms since 1970
    NMX::ESeverity severity;
    QString channel;
    QString text;
  };

  /// What has come in since the GUI thread looked last. Bounded like the model itself, for a thread that logs faster
  /// than the window can show it.
  struct Arrived
  {
    std::deque<Message> messages;
    int warnings = 0;
    int errors = 0;
    bool announced = false;
  };

  void TakeArrived();
  void NoteChannels(const std::deque<Message>& messages);

  std::deque<Message> m_messages;
  QStringList m_channels;
  int m_warnings = 0;
  int m_errors = 0;
  std::mutex m_mutex;
  Arrived m_arrived;
};

}
