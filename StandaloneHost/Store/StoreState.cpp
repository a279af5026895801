#include "StandaloneHost/Store/StoreState.h"

#include "StandaloneHost/Store/CharacterSlots.h"
#include "StandaloneHost/Store/ObjectLinks.h"

#include <utility>

namespace Store
{

namespace
{

/// Takes an id out of an index, which keeps no empty sets.
template <class Index>
void EraseFrom(Index& index, const std::string& key, NMX::TSubjectStoreId id)
{
  if (const auto found = index.find(key); found != index.end() && found->second.erase(id) != 0 && found->second.empty())
    index.erase(found);
}

}

const std::set<NMX::TSubjectStoreId>& StoreState::Subjects(NMX::ESubjectKind kind) const
{
  return m_kinds[static_cast<std::size_t>(kind)];
}

const std::set<NMX::TSubjectStoreId>& StoreState::Linked(const std::string& key) const
{
  static const std::set<NMX::TSubjectStoreId> none;
  const auto found = m_links.find(key);
  return found != m_links.end() ? found->second : none;
}

std::vector<NMX::TSubjectStoreId> StoreState::Named(const std::string& canonical) const
{
  std::vector<NMX::TSubjectStoreId> ids;
  if (const auto found = m_otherNames.find(canonical); found != m_otherNames.end())
    ids.assign(found->second.begin(), found->second.end());
  if (NameRule::IsAscii(canonical))
    if (const SubjectRecord* record = FindExact(canonical); record != nullptr)
      ids.push_back(record->id);
  return ids;
}

const SubjectRecord* StoreState::FindCanonical(std::string_view name) const
{
  const auto ids = Named(NameRule::Canonical(name));
  return ids.empty() ? nullptr : Find(ids.front());
}

void StoreState::Erase(NMX::TSubjectStoreId id, bool linksStay)
{
  const auto found = m_records.find(id);
  if (found == m_records.end())
    return;
  const std::string& name = found->second->Name();
  m_names.erase(name);
  if (!NameRule::IsAscii(name))
    EraseFrom(m_otherNames, NameRule::Canonical(name), id);
  m_kinds[static_cast<std::size_t>(found->second->kind)].erase(id);
  if (!linksStay)
    for (const std::string& key : LinksOf(*found->second))
      EraseFrom(m_links, key, id);
  m_autoAssignable.erase(id);
  m_awaitingObjects.erase(id);
  m_records.erase(found);
}

void StoreState::Insert(std::unique_ptr<SubjectRecord> record, bool linksStay)
{
  auto& place = m_records[record->id];
  place = std::move(record);
  m_names.emplace(place->Name(), place.get());
  if (!NameRule::IsAscii(place->Name()))
    m_otherNames[NameRule::Canonical(place->Name())].insert(place->id);
  m_kinds[static_cast<std::size_t>(place->kind)].insert(place->id);
  if (!linksStay)
    for (const std::string& key : LinksOf(*place))
      m_links[key].insert(place->id);
  if (IsAutoAssignable(*place))
    m_autoAssignable.insert(place->id);
  if (AwaitsObjects(*place))
    m_awaitingObjects.insert(place->id);
}

void StoreState::Apply(ChangeSet&& changes) noexcept
{
  // All old names go before the new ones come, so that two subjects can exchange theirs.
  for (auto& [id, change] : changes.subjects)
  {
    if (const SubjectRecord* old = Find(id); old != nullptr && change.record != nullptr)
    {
      change.record->stamps = old->stamps;
      change.sameLinks = LinksOf(*old) == LinksOf(*change.record);
    }
    Erase(id, change.sameLinks);
  }
  for (auto& [id, change] : changes.subjects)
  {
    if (change.record == nullptr)
      continue;
    for (std::size_t aspect = 0; aspect < change.record->stamps.size(); ++aspect)
      if ((change.aspects >> aspect & 1U) != 0)
        change.record->stamps[aspect] = ++m_lastStamp;
    Insert(std::move(change.record), change.sameLinks);
  }
  for (auto& [path, value] : changes.applicationEntries)
  {
    if (std::holds_alternative<std::monostate>(value))
      m_application.erase(path);
    else
      m_application[path] = std::move(value);
  }
  m_nextId = changes.nextId;
}

}
