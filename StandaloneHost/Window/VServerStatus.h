#pragma once

#include "StandaloneHost/Server/VServer.h"

#include <QElapsedTimer>
#include <QObject>
#include <QTimer>

namespace Window
{

/// What the server does, sampled once a second. [gui]
class VServerStatus final : public QObject
{
  Q_OBJECT
  /// Such as "127.0.0.1:8420".
  Q_PROPERTY(QString address READ Address CONSTANT)
  Q_PROPERTY(int clients READ Clients NOTIFY sampled)
  Q_PROPERTY(double callsPerSecond READ CallsPerSecond NOTIFY sampled)

public:
  /// The server is open and outlives this.
  explicit VServerStatus(const Server::VServer& server, QObject* parent = nullptr);

  [[nodiscard]] QString Address() const { return QString::fromStdString(m_server.Address()); }
  [[nodiscard]] int Clients() const { return static_cast<int>(m_last.connections); }
  [[nodiscard]] double CallsPerSecond() const { return m_callsPerSecond; }

Q_SIGNALS:
  void sampled();

private:
  void Sample();

  const Server::VServer& m_server;
  QTimer m_timer;
  QElapsedTimer m_sinceLast;
  Server::ServerTraffic m_last;
  double m_callsPerSecond = 0;
};

}
