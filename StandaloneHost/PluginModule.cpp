#include "StandaloneHost/PluginModule.h"

#include <dlfcn.h>

#include <string>

namespace
{

template <class Function>
Function* FindSymbol(void* module, const char* name, const std::string& file)
{
  void* symbol = dlsym(module, name);
  if (symbol == nullptr)
    throw PluginError("cannot load the plugin \"" + file + "\": it has no function " + name);
  return reinterpret_cast<Function*>(symbol);
}

}

PluginPointer LoadPlugin(const std::filesystem::path& file)
{
  const std::string name = file.string();
  void* module = dlopen(name.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (module == nullptr)
    throw PluginError("cannot load the plugin: " + std::string(dlerror()));

  auto* const revision = FindSymbol<PluginBuildRevisionFunction>(module, "PluginBuildRevision", name);
  auto* const create = FindSymbol<CreatePluginFunction>(module, "CreatePlugin", name);
  auto* const destroy = FindSymbol<DestroyPluginFunction>(module, "DestroyPlugin", name);
  if (revision() != RunaCorePluginInterface::buildRevision)
    throw PluginError("cannot load the plugin \"" + name + "\": its build revision is " + std::to_string(revision()) +
                      ", this host needs " + std::to_string(RunaCorePluginInterface::buildRevision));
  PluginPointer plugin(create(), PluginDeleter{destroy});
  if (!plugin)
    throw PluginError("cannot load the plugin \"" + name + "\": it could not be created");
  return plugin;
}

std::filesystem::path OwnPluginFile()
{
  return std::filesystem::read_symlink("/proc/self/exe").parent_path().parent_path() / "lib" /
         "RunaCorePluginSubjectStore.so";
}
