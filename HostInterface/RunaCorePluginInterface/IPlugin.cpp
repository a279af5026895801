#include "HostInterface/RunaCorePluginInterface/IPlugin.h"

namespace RunaCorePluginInterface
{

IPlugin::~IPlugin() = default;

const char* IPlugin::PluginName() const
{
  return "";
}

const char* IPlugin::DisplayName() const
{
  return "";
}

bool IPlugin::IsLicensed() const
{
  return true;
}

bool IPlugin::IsVisible() const
{
  return true;
}

bool IPlugin::SupportsLive() const
{
  return true;
}

bool IPlugin::SupportsOffline() const
{
  return true;
}

bool IPlugin::RegisterServices(IPluginHost& /*host*/)
{
  return true;
}

bool IPlugin::RegisterQml(IPluginHost& /*host*/, IQmlContext& /*qmlContext*/)
{
  return true;
}

bool IPlugin::RegisterUserInterface(IPluginHost& /*host*/, IUserInterface& /*userInterface*/)
{
  return true;
}

bool IPlugin::CanClose() const
{
  return true;
}

void IPlugin::UnregisterQml() {}

void IPlugin::RegistrationFinished() {}

}
