#pragma once

#include "StandaloneHost/Store/Schema.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/IStore.h"

#include <map>
#include <string>
#include <vector>

/// What the store says of a subject, by the paths of its entries. Subjects and slots are told by their names, as their
/// numbers are the store's own.
struct SubjectDump
{
  std::map<std::string, NMX::Value> entries;
  std::string parent;
  std::string slot;
  std::vector<std::string> slots;

  friend bool operator==(const SubjectDump&, const SubjectDump&) = default;
};

/// Everything that a store holds, but for the panel's settings.
struct StoreDump
{
  std::map<std::string, SubjectDump> subjects;
  std::map<std::string, NMX::Value> application;

  friend bool operator==(const StoreDump&, const StoreDump&) = default;
};

inline StoreDump Dump(const NMX::IStore& store)
{
  using Id = NMX::TSubjectStoreId;
  namespace Paths = NMX::Paths;
  const auto reader = store.Reader();
  const auto value = [&](Id id, NMX::EntryPath path)
  {
    const NMX::Value* found = nullptr;
    return reader->Find(id, path, found).Succeeded() && found != nullptr ? *found : NMX::Value{};
  };
  const auto nameOf = [&](Id id) { return id.Valid() ? std::get<std::string>(value(id, Paths::Name())) : ""; };

  StoreDump dump;
  for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
  {
    std::vector<Id> ids;
    (void)reader->Subjects(kind, ids);
    for (const Id id : ids)
    {
      SubjectDump& subject = dump.subjects[nameOf(id)];
      for (const Store::SchemaEntry& entry : Store::KindSchema::Of(kind).Entries())
        if (entry.writer == Store::EWriter::Anyone && entry.type != NMX::EValueType::SubjectId &&
            entry.type != NMX::EValueType::Slots)
          subject.entries[std::string(entry.path.Text())] = value(id, entry.path);
      const Id parent = std::get<Id>(value(id, Paths::ParentSubjectId()));
      subject.parent = nameOf(parent);
      const auto slotsOf = [&](Id of)
      {
        const NMX::Value slots = value(of, Paths::Slots());
        const auto* typed = std::get_if<std::vector<NMX::Slot>>(&slots);
        return typed != nullptr ? *typed : std::vector<NMX::Slot>{};
      };
      for (const NMX::Slot& slot : slotsOf(parent))
        if (NMX::Value(slot.id) == value(id, Paths::ParentSubjectSlotId()))
          subject.slot = slot.name;
      for (const NMX::Slot& slot : slotsOf(id))
        subject.slots.push_back(slot.name);
    }
  }
  for (const NMX::EntryPath& path : reader->ApplicationEntries(NMX::EntryPath("Application")))
    if (!path.Text().starts_with("Application/Settings"))
      dump.application.emplace(path.Text(), *reader->FindApplicationEntry(path));
  return dump;
}
