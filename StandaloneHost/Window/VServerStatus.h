#pragma once

#include "StandaloneHost/Server/VServer.h"

#include <QElapsedTimer>
#include <QObject>
#include <QString>
#include <QTimer>

#include <functional>
#include <string>

namespace Window
{

/// What the server does and whether the store keeps edits, sampled once a second. [gui]
class VServerStatus final : public QObject
{
  Q_OBJECT
  /// Such as "127.0.0.1:8420".
  Q_PROPERTY(QString address READ Address CONSTANT)
  Q_PROPERTY(int clients READ Clients NOTIFY sampled)
  Q_PROPERTY(double callsPerSecond READ CallsPerSecond NOTIFY sampled)
  /// Why edits cannot be kept; empty while they can.
  Q_PROPERTY(QString storeFault READ StoreFault NOTIFY sampled)

public:
  /// The server is open and outlives this. `storeFault`, which may be empty, answers why edits cannot be kept.
  VServerStatus(const Server::VServer& server, std::function<std::string()> storeFault, QObject* parent = nullptr);

  [[nodiscard]] QString Address() const { return QString::fromStdString(m_server.Address()); }
  [[nodiscard]] int Clients() const { return static_cast<int>(m_last.connections); }
  [[nodiscard]] double CallsPerSecond() const { return m_callsPerSecond; }
  [[nodiscard]] QString StoreFault() const { return m_storeFault; }

Q_SIGNALS:
  void sampled();

private:
  void Sample();

  const Server::VServer& m_server;
  const std::function<std::string()> m_askStoreFault;
  QTimer m_timer;
  QElapsedTimer m_sinceLast;
  Server::ServerTraffic m_last;
  double m_callsPerSecond = 0;
  QString m_storeFault;
};

}
