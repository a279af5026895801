#include "RunaCorePluginSubjectStore/BasicObjectServices/VBasicObjectServices.h"

#include "RunaCorePluginSubjectStore/BasicObjectServices/BasicObjectWarnings.h"
#include "RunaCorePluginSubjectStore/Subjects/NameCheck.h"
#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"
#include "RunaCorePluginSubjectStore/Subjects/Warnings.h"
#include "StoreInterface/ColourText.h"
#include "StoreInterface/EntryPaths.h"

#include <utility>

namespace BasicObjectServices
{

using NMX::IResult;
using NMX::TSubjectStoreId;
using Subjects::IsBasicObject;
namespace Paths = NMX::Paths;

namespace
{

constexpr auto kind = NMX::ESubjectKind::BasicObjects;

}

VBasicObjectServices::VBasicObjectServices(std::shared_ptr<NMX::IStore> store) : m_store(std::move(store)) {}

IResult VBasicObjectServices::BasicObjectList(std::set<std::string>& names) const
{
  return Subjects::ListNames(*m_store, kind, "Failed to get subject name for store id %1%", names);
}

IResult VBasicObjectServices::Remove(const std::string& name)
{
  return Subjects::EditSubject(*m_store, name, IsBasicObject,
                               [](NMX::IEntryEditor& editor, TSubjectStoreId id) { return editor.Remove(id); });
}

IResult VBasicObjectServices::RemoveAll()
{
  return Subjects::EditAll(*m_store, kind, Subjects::EOnFailure::GoOn,
                           [](NMX::IEntryEditor& editor, TSubjectStoreId id) { return editor.Remove(id); });
}

IResult VBasicObjectServices::Rename(const std::string& oldName, const std::string& newName)
{
  return Subjects::EditSubject(*m_store, oldName, IsBasicObject,
                               [&](NMX::IEntryEditor& editor, TSubjectStoreId id) -> IResult
                               {
                                 if (const IResult checked = Subjects::CheckNewName(newName); checked.Failed())
                                   return checked;
                                 return editor.Rename(id, newName, NMX::ENotify::Yes);
                               });
}

IResult VBasicObjectServices::Enabled(const std::string& name, bool& enabled) const
{
  return Subjects::ReadEntry(*m_store, name, IsBasicObject, Paths::Enabled(), enabled);
}

IResult VBasicObjectServices::SetEnabled(const std::string& name, bool enabled)
{
  return Subjects::WriteEntry(*m_store, name, IsBasicObject, Paths::Enabled(), enabled);
}

IResult VBasicObjectServices::SetAllEnabled(bool enabled)
{
  return Subjects::EditAll(*m_store, kind, Subjects::EOnFailure::Stop,
                           [enabled](NMX::IEntryEditor& editor, TSubjectStoreId id)
                           { return editor.SetValue(id, Paths::Enabled(), enabled); });
}

IResult VBasicObjectServices::Color(const std::string& name, std::string& colorHtml) const
{
  return Subjects::ReadSubject(*m_store, name, IsBasicObject,
                               [&](const NMX::IStoreReader& reader, TSubjectStoreId id)
                               {
                                 NMX::Colour colour;
                                 const IResult read = NMX::Read(reader, id, Paths::ColourRGBA(), colour);
                                 if (read.Succeeded())
                                   colorHtml = NMX::ColourToText(colour);
                                 return read;
                               });
}

IResult VBasicObjectServices::SetColor(const std::string& name, const std::string& colorHtml)
{
  return Subjects::EditSubject(*m_store, name, IsBasicObject,
                               [&](NMX::IEntryEditor& editor, TSubjectStoreId id) -> IResult
                               {
                                 NMX::Colour colour;
                                 if (const IResult read = NMX::ColourFromText(colorHtml, colour); read.Failed())
                                   return read;
                                 return editor.SetValue(id, Paths::ColourRGBA(), colour);
                               });
}

IResult VBasicObjectServices::ProximityGroupName(const std::string& name, std::string& groupName) const
{
  return Subjects::ReadEntry(*m_store, name, IsBasicObject, Paths::ProximityGroupName(), groupName);
}

IResult VBasicObjectServices::SetProximityGroupName(const std::string& name, const std::string& groupName)
{
  return Subjects::WriteEntry(*m_store, name, IsBasicObject, Paths::ProximityGroupName(), groupName);
}

IResult VBasicObjectServices::TemplateGroupName(const std::string& name, std::string& groupName) const
{
  return Subjects::ReadEntry(*m_store, name, IsBasicObject, Paths::TemplateGroupName(), groupName);
}

IResult VBasicObjectServices::SetTemplateGroupName(const std::string& name, const std::string& groupName)
{
  return Subjects::WriteEntry(*m_store, name, IsBasicObject, Paths::TemplateGroupName(), groupName, NMX::ENotify::Yes);
}

IResult VBasicObjectServices::AutoAssignEnabled(const std::string& name, bool& enabled) const
{
  return Subjects::ReadEntry(*m_store, name, IsBasicObject, Paths::AutoAssignEnabled(), enabled);
}

IResult VBasicObjectServices::SetAutoAssignEnabled(const std::string& name, bool enabled)
{
  return Subjects::WriteEntry(*m_store, name, IsBasicObject, Paths::AutoAssignEnabled(), enabled);
}

IResult VBasicObjectServices::AutoAssignedName(const std::string& name, std::string& autoAssignedName) const
{
  return Subjects::ReadEntry(*m_store, name, IsBasicObject, Paths::AutoAssignedName(), autoAssignedName);
}

IResult VBasicObjectServices::BasicObjectWarnings(const std::string& name,
                                                  std::map<EBasicObjectWarning, std::string>& warnings) const
{
  static const Subjects::WarningEntries entries(NMX::basicObjectWarnings);
  return Subjects::ReadSubject(*m_store, name, IsBasicObject, [&](const NMX::IStoreReader& reader, TSubjectStoreId id)
                               { return entries.ReadActive(reader, id, warnings); });
}

std::shared_ptr<NMX::IBasicObjectServices::ChangedCallback> VBasicObjectServices::BasicObjectChangedCallback()
{
  return m_store->SubjectsChanged(kind);
}

}
