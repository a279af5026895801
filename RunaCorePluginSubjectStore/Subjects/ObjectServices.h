#pragma once

#include "HostInterface/NMX/VShared.h"
#include "RunaCorePluginSubjectStore/Subjects/NameCheck.h"
#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"
#include "StoreInterface/ColourText.h"
#include "StoreInterface/EntryPaths.h"

#include <memory>
#include <set>
#include <string>
#include <utility>

namespace Subjects
{

/// What the services of basic and of smart objects have in common: their interfaces declare these operations alike.
template <class Interface>
class ObjectServices : public Interface, public NMX::VShared
{
public:
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

protected:
  /// Serves the subjects of `kind`; of those found by name, the ones that `rule` accepts.
  ObjectServices(std::shared_ptr<NMX::IStore> store, NMX::ESubjectKind kind, SubjectRule rule)
      : m_store(std::move(store)), m_kind(kind), m_rule(rule)
  {
  }

  /// The names of all.
  NMX::IResult List(std::set<std::string>& names) const
  {
    return ListNames(*m_store, m_kind, "Failed to get subject name for store id %1%", names);
  }

  [[nodiscard]] NMX::IStore& Store() const { return *m_store; }
  [[nodiscard]] SubjectRule Rule() const { return m_rule; }
  /// Raised whenever one is added, removed or changed.
  [[nodiscard]] std::shared_ptr<NMX::IStore::ChangeCallback> Changed() { return m_store->SubjectsChanged(m_kind); }

private:
  const std::shared_ptr<NMX::IStore> m_store;
  const NMX::ESubjectKind m_kind;
  const SubjectRule m_rule;
};

template <class Interface>
NMX::IResult ObjectServices<Interface>::Remove(const std::string& name)
{
  return EditSubject(*m_store, name, m_rule,
                     [](NMX::IEntryEditor& editor, NMX::TSubjectStoreId id) { return editor.Remove(id); });
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::RemoveAll()
{
  return EditAll(*m_store, m_kind, EOnFailure::GoOn,
                 [](NMX::IEntryEditor& editor, NMX::TSubjectStoreId id) { return editor.Remove(id); });
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::Rename(const std::string& oldName, const std::string& newName)
{
  return EditSubject(*m_store, oldName, m_rule,
                     [&](NMX::IEntryEditor& editor, NMX::TSubjectStoreId id) -> NMX::IResult
                     {
                       if (const NMX::IResult checked = CheckNewName(newName); checked.Failed())
                         return checked;
                       return editor.Rename(id, newName, NMX::ENotify::Yes);
                     });
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::Enabled(const std::string& name, bool& enabled) const
{
  return ReadEntry(*m_store, name, m_rule, NMX::Paths::Enabled(), enabled);
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::SetEnabled(const std::string& name, bool enabled)
{
  return WriteEntry(*m_store, name, m_rule, NMX::Paths::Enabled(), enabled);
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::SetAllEnabled(bool enabled)
{
  return EditAll(*m_store, m_kind, EOnFailure::Stop, [enabled](NMX::IEntryEditor& editor, NMX::TSubjectStoreId id)
                 { return editor.SetValue(id, NMX::Paths::Enabled(), enabled); });
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::Color(const std::string& name, std::string& colorHtml) const
{
  return ReadSubject(*m_store, name, m_rule,
                     [&](const NMX::IStoreReader& reader, NMX::TSubjectStoreId id)
                     {
                       NMX::Colour colour;
                       const NMX::IResult read = NMX::Read(reader, id, NMX::Paths::ColourRGBA(), colour);
                       if (read.Succeeded())
                         colorHtml = NMX::ColourToText(colour);
                       return read;
                     });
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::SetColor(const std::string& name, const std::string& colorHtml)
{
  return EditSubject(*m_store, name, m_rule,
                     [&](NMX::IEntryEditor& editor, NMX::TSubjectStoreId id) -> NMX::IResult
                     {
                       NMX::Colour colour;
                       if (const NMX::IResult read = NMX::ColourFromText(colorHtml, colour); read.Failed())
                         return read;
                       return editor.SetValue(id, NMX::Paths::ColourRGBA(), colour);
                     });
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::ProximityGroupName(const std::string& name, std::string& groupName) const
{
  return ReadEntry(*m_store, name, m_rule, NMX::Paths::ProximityGroupName(), groupName);
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::SetProximityGroupName(const std::string& name, const std::string& groupName)
{
  return WriteEntry(*m_store, name, m_rule, NMX::Paths::ProximityGroupName(), groupName);
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::TemplateGroupName(const std::string& name, std::string& groupName) const
{
  return ReadEntry(*m_store, name, m_rule, NMX::Paths::TemplateGroupName(), groupName);
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::SetTemplateGroupName(const std::string& name, const std::string& groupName)
{
  return WriteEntry(*m_store, name, m_rule, NMX::Paths::TemplateGroupName(), groupName, NMX::ENotify::Yes);
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::AutoAssignEnabled(const std::string& name, bool& enabled) const
{
  return ReadEntry(*m_store, name, m_rule, NMX::Paths::AutoAssignEnabled(), enabled);
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::SetAutoAssignEnabled(const std::string& name, bool enabled)
{
  return WriteEntry(*m_store, name, m_rule, NMX::Paths::AutoAssignEnabled(), enabled);
}

template <class Interface>
NMX::IResult ObjectServices<Interface>::AutoAssignedName(const std::string& name, std::string& autoAssignedName) const
{
  return ReadEntry(*m_store, name, m_rule, NMX::Paths::AutoAssignedName(), autoAssignedName);
}

}
