#pragma once

#include "HostInterface/RunaCorePluginInterface/IPlugin.h"

#include <filesystem>
#include <memory>
#include <stdexcept>

/// A plugin that cannot be used; the text is for people and names the file.
class PluginError : public std::runtime_error
{
public:
  using std::runtime_error::runtime_error;
};

/// Gives the plugin object back to the module that made it.
struct PluginDeleter
{
  DestroyPluginFunction* destroy;
  void operator()(RunaCorePluginInterface::IPlugin* plugin) const { destroy(plugin); }
};

using PluginPointer = std::unique_ptr<RunaCorePluginInterface::IPlugin, PluginDeleter>;

/// Loads a plugin module, checks its revision and creates its plugin object. The module stays loaded until the program
/// ends: what it registered globally refers to its code. Throws PluginError. [host]
[[nodiscard]] PluginPointer LoadPlugin(const std::filesystem::path& file);

/// The module that was built with this program.
[[nodiscard]] std::filesystem::path OwnPluginFile();
