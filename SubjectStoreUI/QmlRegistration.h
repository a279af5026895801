#pragma once

#include <QQmlPropertyMap>
#include <QString>
#include <QVariant>

#include <utility>
#include <vector>

class QQmlEngine;

namespace SubjectStoreUI
{

/// Named constants for QML, such as SubjectFlags.Smart. QML can neither change nor add one; to read a name that is not
/// there gives nothing. [gui]
class ConstantMap final : public QQmlPropertyMap
{
  Q_OBJECT

public:
  explicit ConstantMap(const std::vector<std::pair<QString, QVariant>>& constants, QObject* parent = nullptr);

protected:
  QVariant updateValue(const QString& key, const QVariant& input) override;
};

inline constexpr const char* moduleUri = "Tavix.SubjectStore";

/// Registers the module "Tavix.SubjectStore" 1.0 in the program: its seven singletons of constants, and the type
/// SubjectStoreQml, which QML may name but not create. To be called before QML that imports it is loaded; a second call
/// does nothing.
void RegisterModule();

/// Lets the engine find the module's QML files, which are resources of this library.
void AddModuleFiles(QQmlEngine& engine);

}
