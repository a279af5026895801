#pragma once

#include "HostInterface/RunaCorePluginInterface/IQmlContext.h"
#include "HostInterface/RunaCorePluginInterface/IUserInterface.h"
#include "StandaloneHost/Window/VCommandMenus.h"
#include "StandaloneHost/Window/VLogFilterModel.h"
#include "StandaloneHost/Window/VServerStatus.h"
#include "StandaloneHost/Window/VWindowSettings.h"

#include <QObject>
#include <QPointer>
#include <QTimer>
#include <QUrl>

#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>

class QQmlApplicationEngine;
class QWindow;

namespace Window
{

/// A window that cannot be shown; the text is for people.
class WindowError : public std::runtime_error
{
public:
  using std::runtime_error::runtime_error;
};

/// The host's window with the engine of its QML: what plugins bring to both, and what the window's QML knows of the
/// program. Destroying it destroys the engine, so QML objects of plugins have to live until then. [gui]
class VWindow final : public QObject,
                      public RunaCorePluginInterface::IQmlContext,
                      public RunaCorePluginInterface::IUserInterface
{
  Q_OBJECT
  Q_PROPERTY(QAbstractItemModel* log READ Log CONSTANT)                 ///< VLogModel
  Q_PROPERTY(QAbstractItemModel* filteredLog READ FilteredLog CONSTANT) ///< VLogFilterModel
  Q_PROPERTY(QObject* commands READ Commands CONSTANT)                  ///< VCommandMenus
  Q_PROPERTY(QObject* settings READ Settings CONSTANT)                  ///< VWindowSettings
  Q_PROPERTY(QObject* server READ Server CONSTANT)                      ///< VServerStatus
  /// The operator's panel; empty when no plugin brings one.
  Q_PROPERTY(QUrl panel READ Panel CONSTANT)
  /// What a plugin publishes as "rootContextSubjectStore", with the operations on files; null when none does.
  Q_PROPERTY(QObject* store READ Store CONSTANT)
  Q_PROPERTY(QString version READ Version CONSTANT)

public:
  /// `log` outlives the window. Settings are kept in the data folder, if there is one.
  VWindow(VLogModel& log, const std::optional<std::filesystem::path>& dataFolder);
  ~VWindow() override;

  [[nodiscard]] QQmlEngine& Engine() const override;
  [[nodiscard]] QQmlContext& RootContext() const override;
  [[nodiscard]] std::uint32_t ThemeColour(std::string_view name) const override;
  void AddCommand(RunaCorePluginInterface::MenuCommand command) override;

  /// Shows the window, after plugins have added what they have. The server is open and outlives the window; `canClose`
  /// is asked before the user closes it, and `storeFault`, now and then, why edits cannot be kept (empty: they can).
  /// Throws WindowError.
  void Show(const Server::VServer& server, std::function<bool()> canClose,
            std::function<std::string()> storeFault = {});

  /// Whether the user may close the window now. If so, that is the last moment at which its place is known.
  Q_INVOKABLE [[nodiscard]] bool mayClose();
  /// Puts a text on the clipboard.
  Q_INVOKABLE void copy(const QString& text) const;
  Q_INVOKABLE [[nodiscard]] bool fileExists(const QUrl& file) const;

  [[nodiscard]] QAbstractItemModel* Log() const { return &m_log; }
  [[nodiscard]] QAbstractItemModel* FilteredLog() { return &m_filteredLog; }
  [[nodiscard]] QObject* Commands() { return &m_commands; }
  [[nodiscard]] QObject* Settings() { return &m_settings; }
  [[nodiscard]] QObject* Server() const { return m_server.get(); }
  [[nodiscard]] QUrl Panel() const;
  [[nodiscard]] QObject* Store() const;
  [[nodiscard]] QString Version() const;

private:
  void Place();
  void KeepPlace();

  VLogModel& m_log;
  VLogFilterModel m_filteredLog;
  VCommandMenus m_commands;
  VWindowSettings m_settings;
  std::unique_ptr<VServerStatus> m_server;
  std::function<bool()> m_canClose;
  QTimer m_moved;
  // After everything that its objects refer to.
  std::unique_ptr<QQmlApplicationEngine> m_engine;
  mutable std::unique_ptr<QObject> m_theme;
  QPointer<QWindow> m_window; // the engine's
};

}
