#include "StandaloneHost/Window/VLogModel.h"

#include <QDateTime>

#include <utility>

namespace Window
{

namespace
{

QString ToText(std::string_view text)
{
  return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

}

void VLogModel::Append(const NMX::LogRecord& record)
{
  Message message{QDateTime::currentMSecsSinceEpoch(), record.severity, ToText(record.channel), ToText(record.text)};
  const std::lock_guard lock(m_mutex);
  if (record.severity <= NMX::ESeverity::Error)
    ++m_arrived.errors;
  else if (record.severity == NMX::ESeverity::Warning)
    ++m_arrived.warnings;
  m_arrived.messages.push_back(std::move(message));
  if (m_arrived.messages.size() > capacity)
    m_arrived.messages.pop_front();
  if (!std::exchange(m_arrived.announced, true))
    QMetaObject::invokeMethod(this, [this] { TakeArrived(); }, Qt::QueuedConnection);
}

void VLogModel::TakeArrived()
{
  Arrived arrived;
  {
    const std::lock_guard lock(m_mutex);
    std::swap(arrived, m_arrived);
  }
  const std::size_t count = m_messages.size() + arrived.messages.size();
  if (count > capacity)
  {
    const auto gone = static_cast<std::ptrdiff_t>(std::min(count - capacity, m_messages.size()));
    if (gone > 0)
    {
      beginRemoveRows({}, 0, static_cast<int>(gone) - 1);
      m_messages.erase(m_messages.begin(), m_messages.begin() + gone);
      endRemoveRows();
    }
  }
  NoteChannels(arrived.messages);
  const int first = rowCount();
  beginInsertRows({}, first, first + static_cast<int>(arrived.messages.size()) - 1);
  std::move(arrived.messages.begin(), arrived.messages.end(), std::back_inserter(m_messages));
  endInsertRows();
  if (arrived.warnings + arrived.errors > 0)
  {
    m_warnings += arrived.warnings;
    m_errors += arrived.errors;
    Q_EMIT countsChanged();
  }
}

void VLogModel::NoteChannels(const std::deque<Message>& messages)
{
  const qsizetype known = m_channels.size();
  for (const Message& message : messages)
    if (!m_channels.contains(message.channel))
      m_channels.append(message.channel);
  if (m_channels.size() == known)
    return;
  m_channels.sort();
  Q_EMIT channelsChanged();
}

int VLogModel::rowCount(const QModelIndex& parent) const
{
  return parent.isValid() ? 0 : static_cast<int>(m_messages.size());
}

QVariant VLogModel::data(const QModelIndex& index, int role) const
{
  if (!checkIndex(index, CheckIndexOption::IndexIsValid))
    return {};
  const Message& message = m_messages[static_cast<std::size_t>(index.row())];
  switch (role)
  {
  case Time:
    return QDateTime::fromMSecsSinceEpoch(message.time).toString("hh:mm:ss.zzz");
  case Severity:
    return static_cast<int>(message.severity);
  case SeverityName:
    return ToText(NMX::SeverityName(message.severity));
  case Channel:
    return message.channel;
  case Text:
  case Qt::DisplayRole:
    return message.text;
  default:
    return {};
  }
}

QHash<int, QByteArray> VLogModel::roleNames() const
{
  return {{Time, "time"}, {Severity, "severity"}, {SeverityName, "severityName"}, {Channel, "channel"}, {Text, "text"}};
}

}
