#include "StandaloneHost/Store/Draft.h"

#include "StandaloneHost/Store/VStoreReader.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace Store
{

namespace
{

constexpr std::uint8_t allAspects = 0x1F;

}

const SubjectRecord* Draft::Find(Id id) const
{
  const auto changed = m_changes.subjects.find(id);
  return changed != m_changes.subjects.end() ? changed->second.record.get() : m_base.Find(id);
}

const SubjectRecord* Draft::Find(std::string_view name) const
{
  const SubjectRecord* record = FindExact(name);
  return record != nullptr ? record : FindCanonical(name);
}

const SubjectRecord* Draft::FindExact(std::string_view name) const
{
  if (const auto changed = m_names.find(name); changed != m_names.end())
    return Find(changed->second);
  const SubjectRecord* record = m_base.FindExact(name);
  return record != nullptr ? Find(record->id) : nullptr;
}

const SubjectRecord* Draft::FindCanonical(std::string_view name) const
{
  if (NameRule::IsAscii(name) && m_otherNames.empty() && m_base.Find(name) == nullptr)
    return nullptr;
  const std::string canonical = NameRule::Canonical(name);
  std::vector<Id> candidates = m_base.Named(canonical);
  const auto [first, last] = m_otherNames.equal_range(canonical);
  std::transform(first, last, std::back_inserter(candidates), [](const auto& named) { return named.second; });
  if (const auto changed = m_names.find(canonical); changed != m_names.end())
    candidates.push_back(changed->second);
  for (const Id id : candidates)
    if (const SubjectRecord* record = Find(id); record != nullptr && NameRule::Canonical(record->Name()) == canonical)
      return record;
  return nullptr;
}

std::vector<Draft::Id> Draft::Subjects(NMX::ESubjectKind kind) const
{
  const auto& committed = m_base.Subjects(kind);
  std::vector<Id> ids;
  ids.reserve(committed.size());
  for (const Id id : committed)
    if (Find(id) != nullptr)
      ids.push_back(id);
  // Added subjects have higher ids than all committed ones.
  for (const auto& [id, change] : m_changes.subjects)
    if (change.kind == kind && change.record != nullptr && m_base.Find(id) == nullptr)
      ids.push_back(id);
  return ids;
}

const NMX::Value* Draft::FindApplicationEntry(NMX::EntryPath path) const
{
  if (const auto changed = m_changes.applicationEntries.find(path); changed != m_changes.applicationEntries.end())
    return std::holds_alternative<std::monostate>(changed->second) ? nullptr : &changed->second;
  const auto found = m_base.ApplicationEntries().find(path);
  return found != m_base.ApplicationEntries().end() ? &found->second : nullptr;
}

std::vector<NMX::EntryPath> Draft::ApplicationEntries(NMX::EntryPath path) const
{
  auto entries = m_base.ApplicationEntries();
  for (const auto& [changedPath, value] : m_changes.applicationEntries)
  {
    if (std::holds_alternative<std::monostate>(value))
      entries.erase(changedPath);
    else
      entries[changedPath] = value;
  }
  return EntriesBeneath(entries, path);
}

Draft::Id Draft::Add(NMX::ESubjectKind kind, std::string name)
{
  const Id id = m_changes.nextId;
  Name(id, name);
  auto record = std::make_unique<SubjectRecord>(id, kind, std::move(name));
  m_changes.subjects.emplace(id, ChangedSubject{std::move(record), kind, allAspects});
  m_changes.nextId = Id(id.Value() + 1);
  return id;
}

SubjectRecord& Draft::Change(Id id, NMX::EAspect aspect)
{
  auto changed = m_changes.subjects.find(id);
  if (changed == m_changes.subjects.end())
  {
    const SubjectRecord* committed = m_base.Find(id);
    changed =
        m_changes.subjects.emplace(id, ChangedSubject{std::make_unique<SubjectRecord>(*committed), committed->kind})
            .first;
  }
  changed->second.aspects |= static_cast<std::uint8_t>(1U << static_cast<unsigned>(aspect));
  return *changed->second.record;
}

void Draft::Remove(Id id)
{
  const SubjectRecord* record = Find(id);
  const NMX::ESubjectKind kind = record->kind;
  m_names[record->Name()] = Id{};
  if (m_base.Find(id) == nullptr)
    m_changes.subjects.erase(id);
  else
    m_changes.subjects.insert_or_assign(id, ChangedSubject{nullptr, kind, allAspects});
}

void Draft::Rename(Id id, std::string name)
{
  SubjectRecord& record = Change(id, NMX::EAspect::Parameters);
  m_names[record.Name()] = Id{};
  Name(id, name);
  record.name = std::move(name);
}

void Draft::Name(Id id, const std::string& name)
{
  m_names[name] = id;
  if (!NameRule::IsAscii(name))
    m_otherNames.emplace(NameRule::Canonical(name), id);
}

void Draft::MoveUnder(Id id, Id parent, Id slot)
{
  const auto childrenOf = [this](Id of) -> std::vector<Id>&
  { return std::get<std::vector<Id>>(Change(of, NMX::EAspect::Parameters).values[CommonValue::children]); };
  SubjectRecord& record = Change(id, NMX::EAspect::Parameters);
  if (record.Parent() != parent)
  {
    if (record.Parent().Valid())
      std::erase(childrenOf(record.Parent()), id);
    if (parent.Valid())
    {
      auto& siblings = childrenOf(parent);
      siblings.insert(std::lower_bound(siblings.begin(), siblings.end(), id), id);
    }
  }
  record.values[CommonValue::parent] = parent;
  record.values[CommonValue::parentSlot] = slot;
}

void Draft::SetApplicationEntry(NMX::EntryPath path, NMX::Value value)
{
  if (std::holds_alternative<std::monostate>(value))
    m_entriesRemoved += FindApplicationEntry(path) != nullptr;
  else
    m_entriesAdded += FindApplicationEntry(path) == nullptr;
  m_changes.applicationEntries.insert_or_assign(path, std::move(value));
}

}
