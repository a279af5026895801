#pragma once

#include "StandaloneHost/Store/StoreState.h"

#include <map>
#include <string>

namespace Store
{

/// The committed state with an edit's changes laid over it. A record is copied the first time that it is changed, so
/// that an edit costs what it changes, and dropping the draft undoes it.
class Draft
{
public:
  using Id = NMX::TSubjectStoreId;

  /// Nothing is read from the base before Begin: until then somebody else may be writing it.
  explicit Draft(const StoreState& base) : m_base(base) {}
  void Begin() { m_changes.nextId = m_base.NextId(); }

  [[nodiscard]] const SubjectRecord* Find(Id id) const;
  [[nodiscard]] const SubjectRecord* Find(std::string_view name) const;
  [[nodiscard]] std::vector<Id> Subjects(NMX::ESubjectKind kind) const;
  [[nodiscard]] const NMX::Value* FindApplicationEntry(NMX::EntryPath path) const;
  [[nodiscard]] std::size_t ApplicationEntryCount() const
  {
    return m_base.ApplicationEntries().size() + m_entriesAdded - m_entriesRemoved;
  }
  [[nodiscard]] std::vector<NMX::EntryPath> ApplicationEntries(NMX::EntryPath path) const;

  /// Adds a subject; nobody has its name.
  Id Add(NMX::ESubjectKind kind, std::string name);
  void Remove(Id id);
  void Rename(Id id, std::string name);
  void SetApplicationEntry(NMX::EntryPath path, NMX::Value value);

  /// Makes a subject the child of another, or of none, and puts it into that slot of its new parent, or none.
  void MoveUnder(Id id, Id parent, Id slot = {});

  /// The subject's record, to be changed in the given aspect. The subject exists.
  SubjectRecord& Change(Id id, NMX::EAspect aspect);

  [[nodiscard]] const StoreState& Base() const { return m_base; }
  [[nodiscard]] const ChangeSet& Changes() const { return m_changes; }
  [[nodiscard]] ChangeSet& Changes() { return m_changes; }

private:
  [[nodiscard]] const SubjectRecord* FindExact(std::string_view name) const;
  [[nodiscard]] const SubjectRecord* FindCanonical(std::string_view name) const;
  void Name(Id id, const std::string& name);

  const StoreState& m_base;
  ChangeSet m_changes;
  std::map<std::string, Id, std::less<>> m_names; // names that changed; the invalid id: nobody has it any more
  std::multimap<std::string, Id> m_otherNames;    // given here and not ASCII, by canonical form; some are left again
  std::size_t m_entriesAdded = 0;
  std::size_t m_entriesRemoved = 0;
};

}
