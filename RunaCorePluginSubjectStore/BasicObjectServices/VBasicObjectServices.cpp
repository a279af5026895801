#include "RunaCorePluginSubjectStore/BasicObjectServices/VBasicObjectServices.h"

#include "RunaCorePluginSubjectStore/BasicObjectServices/BasicObjectWarnings.h"
#include "RunaCorePluginSubjectStore/Subjects/Warnings.h"

#include <utility>

namespace BasicObjectServices
{

using NMX::IResult;

VBasicObjectServices::VBasicObjectServices(std::shared_ptr<NMX::IStore> store)
    : ObjectServices(std::move(store), NMX::ESubjectKind::BasicObjects, Subjects::MustBeBasicObject)
{
}

IResult VBasicObjectServices::BasicObjectList(std::set<std::string>& names) const
{
  return List(names);
}

IResult VBasicObjectServices::BasicObjectWarnings(const std::string& name,
                                                  std::map<EBasicObjectWarning, std::string>& warnings) const
{
  static const Subjects::WarningEntries entries(NMX::basicObjectWarnings);
  return Subjects::ReadSubject(Store(), name, Rule(), [&](const NMX::IStoreReader& reader, NMX::TSubjectStoreId id)
                               { return entries.ReadActive(reader, id, warnings); });
}

std::shared_ptr<NMX::IBasicObjectServices::ChangedCallback> VBasicObjectServices::BasicObjectChangedCallback()
{
  return Changed();
}

}
