// A module that was built against other interfaces: a host must not create a plugin from it.

#include "HostInterface/RunaCorePluginInterface/IPlugin.h"

#include <cstdlib>

extern "C" RunaCorePluginInterface::IPlugin* CreatePlugin()
{
  std::abort();
}

extern "C" void DestroyPlugin(RunaCorePluginInterface::IPlugin* /*plugin*/)
{
  std::abort();
}

extern "C" std::uint32_t PluginBuildRevision()
{
  return RunaCorePluginInterface::buildRevision - 1;
}
