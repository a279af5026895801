#pragma once

#include "StandaloneHost/Store/NameRule.h"
#include "StandaloneHost/Store/SubjectRecord.h"

#include <boost/unordered/unordered_flat_map.hpp>

#include <array>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace Store
{

/// A record that an edit has changed, added or removed.
struct ChangedSubject
{
  std::unique_ptr<SubjectRecord> record; ///< null when the subject is removed
  NMX::ESubjectKind kind;
  std::uint8_t aspects = 0; ///< one bit for each EAspect that changed
  bool sameLinks = false;   ///< as before the change; worked out when it is applied
};

/// What one commit changes.
struct ChangeSet
{
  std::map<NMX::TSubjectStoreId, ChangedSubject> subjects;
  std::map<NMX::EntryPath, NMX::Value> applicationEntries; ///< "no value" removes the entry
  NMX::TSubjectStoreId nextId;

  [[nodiscard]] bool Empty() const { return subjects.empty() && applicationEntries.empty(); }
};

/// The committed content of the store, with its indexes. Not safe for concurrent use: its owner locks.
class StoreState
{
public:
  [[nodiscard]] const SubjectRecord* Find(NMX::TSubjectStoreId id) const
  {
    const auto found = m_records.find(id);
    return found != m_records.end() ? found->second.get() : nullptr;
  }

  /// The subject of that very name, or else of one that is the same in its canonical form.
  [[nodiscard]] const SubjectRecord* Find(std::string_view name) const
  {
    const SubjectRecord* record = FindExact(name);
    return record != nullptr || (m_otherNames.empty() && NameRule::IsAscii(name)) ? record : FindCanonical(name);
  }
  [[nodiscard]] const SubjectRecord* FindExact(std::string_view name) const
  {
    const auto found = m_names.find(name);
    return found != m_names.end() ? found->second : nullptr;
  }
  /// All whose names have that canonical form; there is more than one only in stores of earlier versions.
  [[nodiscard]] std::vector<NMX::TSubjectStoreId> Named(const std::string& canonical) const;

  [[nodiscard]] const std::set<NMX::TSubjectStoreId>& Subjects(NMX::ESubjectKind kind) const;

  /// The objects that have a link (see LinksOf).
  [[nodiscard]] const std::set<NMX::TSubjectStoreId>& Linked(const std::string& key) const;
  /// The objects that may be assigned to slots, see IsAutoAssignable.
  [[nodiscard]] const std::set<NMX::TSubjectStoreId>& AutoAssignable() const { return m_autoAssignable; }
  /// The characters whose empty slots are to be filled, see AwaitsObjects.
  [[nodiscard]] const std::set<NMX::TSubjectStoreId>& AwaitingObjects() const { return m_awaitingObjects; }
  [[nodiscard]] const std::map<NMX::EntryPath, NMX::Value>& ApplicationEntries() const { return m_application; }
  [[nodiscard]] NMX::TSubjectStoreId NextId() const { return m_nextId; }
  [[nodiscard]] std::size_t SubjectCount() const { return m_records.size(); }

  /// Takes over a commit's changes and stamps what changed. The changes are already lasting when this runs, so it may
  /// not fail: without memory the program ends rather than go on with half of them.
  void Apply(ChangeSet&& changes) noexcept;

private:
  /// The standard hash takes a long text by words, not by bytes.
  using TextIndex = boost::unordered_flat_map<std::string, std::set<NMX::TSubjectStoreId>, std::hash<std::string>>;

  [[nodiscard]] const SubjectRecord* FindCanonical(std::string_view name) const;
  void Insert(std::unique_ptr<SubjectRecord> record, bool linksStay);
  void Erase(NMX::TSubjectStoreId id, bool linksStay);

  boost::unordered_flat_map<NMX::TSubjectStoreId, std::unique_ptr<SubjectRecord>, std::hash<NMX::TSubjectStoreId>>
      m_records;
  boost::unordered_flat_map<std::string_view, const SubjectRecord*> m_names; // keys look into the records
  TextIndex m_otherNames;                                                    // not ASCII; by canonical form
  std::array<std::set<NMX::TSubjectStoreId>, NMX::allSubjectKinds.size()> m_kinds;
  TextIndex m_links;
  std::set<NMX::TSubjectStoreId> m_autoAssignable;
  std::set<NMX::TSubjectStoreId> m_awaitingObjects;
  std::map<NMX::EntryPath, NMX::Value> m_application;
  NMX::TSubjectStoreId m_nextId{1};
  std::uint64_t m_lastStamp = 0;
};

}
