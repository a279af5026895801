#pragma once

#include <cstdint>

namespace RunaCorePluginInterface
{

class IPluginHost;
class IQmlContext;
class IUserInterface;

/// What a host loads. Every operation has a default, so that a plugin overrides only what it contributes.
/// All operations are called on the host's own thread; RegisterQml on that of the QML engine. [host]
class IPlugin
{
public:
  IPlugin() = default;
  IPlugin(const IPlugin&) = delete;
  IPlugin& operator=(const IPlugin&) = delete;
  virtual ~IPlugin();

  /// Constant texts, never null, owned by the plugin.
  [[nodiscard]] virtual const char* PluginName() const;
  [[nodiscard]] virtual const char* DisplayName() const;

  /// Questions that a host may ask before it uses the plugin; all true by default.
  [[nodiscard]] virtual bool IsLicensed() const;
  [[nodiscard]] virtual bool IsVisible() const;
  [[nodiscard]] virtual bool SupportsLive() const;
  [[nodiscard]] virtual bool SupportsOffline() const;

  /// Adds the plugin's services to the host. An exception that a service throws while it is built passes through.
  virtual bool RegisterServices(IPluginHost& host);

  /// Adds QML types and objects.
  virtual bool RegisterQml(IPluginHost& host, IQmlContext& qmlContext);

  /// Adds commands to the host's menus.
  virtual bool RegisterUserInterface(IPluginHost& host, IUserInterface& userInterface);

  /// Asked before the host closes; true by default.
  [[nodiscard]] virtual bool CanClose() const;

  /// Withdraws what RegisterQml registered globally.
  virtual void UnregisterQml();

  /// Called once everything is registered.
  virtual void RegistrationFinished();
};

/// The revision of these interfaces; host and module work together only when theirs are equal.
inline constexpr std::uint32_t buildRevision = 155050;

}

// The functions that a module exports. The names are not mangled.
using CreatePluginFunction = RunaCorePluginInterface::IPlugin*();
using DestroyPluginFunction = void(RunaCorePluginInterface::IPlugin*);
using PluginBuildRevisionFunction = std::uint32_t();
