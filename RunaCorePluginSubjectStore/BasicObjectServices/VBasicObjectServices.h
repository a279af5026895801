#pragma once

#include "HostInterface/NMX/VShared.h"
#include "RunaCorePluginSubjectStore/BasicObjectServices/IBasicObjectServices.h"
#include "StoreInterface/IStore.h"

namespace BasicObjectServices
{

/// Answers the remote group "BasicObjectServices" from the subject store. Keeps no state of its own. [strand]
class VBasicObjectServices : public NMX::IBasicObjectServices, public NMX::VShared
{
public:
  explicit VBasicObjectServices(std::shared_ptr<NMX::IStore> store);

  NMX::IResult BasicObjectList(std::set<std::string>& names) const override;
  NMX::IResult Remove(const std::string& name) override;
  NMX::IResult RemoveAll() override;
  NMX::IResult Rename(const std::string& oldName, const std::string& newName) override;
  NMX::IResult Enabled(const std::string& name, bool& enabled) const override;
  NMX::IResult SetEnabled(const std::string& name, bool enabled) override;
  NMX::IResult SetAllEnabled(bool enabled) override;
  NMX::IResult Color(const std::string& name, std::string& colorHtml) const override;
  NMX::IResult SetColor(const std::string& name, const std::string& colorHtml) override;
  NMX::IResult ProximityGroupName(const std::string& name, std::string& groupName) const override;
  NMX::IResult SetProximityGroupName(const std::string& name, const std::string& groupName) override;
  NMX::IResult TemplateGroupName(const std::string& name, std::string& groupName) const override;
  NMX::IResult SetTemplateGroupName(const std::string& name, const std::string& groupName) override;
  NMX::IResult AutoAssignEnabled(const std::string& name, bool& enabled) const override;
  NMX::IResult SetAutoAssignEnabled(const std::string& name, bool enabled) override;
  NMX::IResult AutoAssignedName(const std::string& name, std::string& autoAssignedName) const override;
  NMX::IResult BasicObjectWarnings(const std::string& name,
                                   std::map<EBasicObjectWarning, std::string>& warnings) const override;
  std::shared_ptr<ChangedCallback> BasicObjectChangedCallback() override;

private:
  const std::shared_ptr<NMX::IStore> m_store;
};

}
