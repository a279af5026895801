#pragma once

#include "RunaCorePluginSubjectStore/BasicObjectServices/IBasicObjectServices.h"
#include "RunaCorePluginSubjectStore/Subjects/ObjectServices.h"

namespace BasicObjectServices
{

/// Answers the remote group "BasicObjectServices" from the subject store. Keeps no state of its own. [strand]
class VBasicObjectServices : public Subjects::ObjectServices<NMX::IBasicObjectServices>
{
public:
  explicit VBasicObjectServices(std::shared_ptr<NMX::IStore> store);

  NMX::IResult BasicObjectList(std::set<std::string>& names) const override;
  NMX::IResult BasicObjectWarnings(const std::string& name,
                                   std::map<EBasicObjectWarning, std::string>& warnings) const override;
  std::shared_ptr<ChangedCallback> BasicObjectChangedCallback() override;
};

}
