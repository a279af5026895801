#pragma once

class QQmlContext;
class QQmlEngine;

namespace RunaCorePluginInterface
{

/// The QML engine to which a plugin adds types and objects. Both outlive the plugin's QML objects or are destroyed
/// without using them any more. [gui]
class IQmlContext
{
public:
  IQmlContext() = default;
  IQmlContext(const IQmlContext&) = delete;
  IQmlContext& operator=(const IQmlContext&) = delete;
  virtual ~IQmlContext() = default;

  [[nodiscard]] virtual QQmlEngine& Engine() const = 0;
  [[nodiscard]] virtual QQmlContext& RootContext() const = 0;
};

}
