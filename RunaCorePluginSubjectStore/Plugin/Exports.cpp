#include "RunaCorePluginSubjectStore/Plugin/VRunaCorePluginSubjectStore.h"

#include <new>

/// Allocates the plugin object and nothing else; null when there is no memory.
extern "C" [[gnu::visibility("default")]] RunaCorePluginInterface::IPlugin* CreatePlugin()
{
  return new (std::nothrow) VRunaCorePluginSubjectStore;
}

extern "C" [[gnu::visibility("default")]] void DestroyPlugin(RunaCorePluginInterface::IPlugin* plugin)
{
  delete plugin;
}

extern "C" [[gnu::visibility("default")]] std::uint32_t PluginBuildRevision()
{
  return RunaCorePluginInterface::buildRevision;
}
