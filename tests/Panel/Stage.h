#pragma once

#include "HostInterface/RunaCorePluginInterface/IQmlContext.h"
#include "StandaloneHost/PluginModule.h"
#include "StoreInterface/IStore.h"

#include <QObject>
#include <QQmlEngine>
#include <QVariantList>

#include <memory>

/// A stage of its own for the panel of one QML engine: the standalone host's services, the plugin that shows them, and
/// what a test asks or changes behind the panel's back, as a remote client would.
class Stage final : public QObject, public RunaCorePluginInterface::IQmlContext
{
  Q_OBJECT

public:
  explicit Stage(QQmlEngine& engine);
  ~Stage() override;

  [[nodiscard]] QQmlEngine& Engine() const override { return m_engine; }
  [[nodiscard]] QQmlContext& RootContext() const override { return *m_engine.rootContext(); }

  /// Empties the stage.
  Q_INVOKABLE void clear();
  /// Adds a subject of the kind with that key.
  Q_INVOKABLE bool add(const QString& kind, const QString& name);
  Q_INVOKABLE bool remove(const QString& name);
  Q_INVOKABLE bool rename(const QString& name, const QString& newName);
  /// Sets an entry: a truth value, a number, a text, or, of the parent, a subject's name.
  Q_INVOKABLE bool set(const QString& name, const QString& path, const QVariant& value);
  Q_INVOKABLE bool setMarkers(const QString& name, const QVariantList& places);
  /// Clusters: {label, device, pattern, type}; of the usual type without one.
  Q_INVOKABLE bool setClusters(const QString& name, const QVariantList& clusters);
  Q_INVOKABLE bool setSlots(const QString& name, const QStringList& slotNames);
  Q_INVOKABLE void addDevice(const QString& urn);
  Q_INVOKABLE bool addPreset(int id, const QString& name, const QString& colour);

  Q_INVOKABLE [[nodiscard]] bool has(const QString& name) const;
  /// The names of all subjects of a kind, in the order of their ids.
  Q_INVOKABLE [[nodiscard]] QStringList names(const QString& kind) const;
  /// An entry; the parent as a name, a colour as text.
  Q_INVOKABLE [[nodiscard]] QVariant entry(const QString& name, const QString& path) const;
  /// "label device pattern" of each cluster.
  Q_INVOKABLE [[nodiscard]] QStringList clusters(const QString& name) const;
  /// The setting with that key.
  Q_INVOKABLE [[nodiscard]] QVariant setting(const QString& key) const;
  Q_INVOKABLE [[nodiscard]] QString folder() const;
  Q_INVOKABLE [[nodiscard]] bool fileExists(const QString& name) const;
  Q_INVOKABLE void writeFile(const QString& name, const QString& text) const;
  /// Whether the plugin's menu command can be triggered; the reason why not is empty then.
  Q_INVOKABLE [[nodiscard]] QString commandProblem() const;
  Q_INVOKABLE bool triggerCommand();

  /// The name of the slot that the subject is in; empty when it is in none.
  Q_INVOKABLE [[nodiscard]] QString slotOf(const QString& name) const;
  /// The places of the markers, as setMarkers takes them.
  Q_INVOKABLE [[nodiscard]] QVariantList markers(const QString& name) const;
  /// A text, a colour or a truth value of the application, as text; empty when it is not set.
  Q_INVOKABLE [[nodiscard]] QString applicationEntry(const QString& path) const;
  /// A truth value, a number or a text; nothing to remove the entry.
  Q_INVOKABLE bool setApplicationEntry(const QString& path, const QVariant& value);

private:
  struct Services;

  QQmlEngine& m_engine;
  std::unique_ptr<Services> m_services;
};
