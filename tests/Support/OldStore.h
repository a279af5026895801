#pragma once

#include "StandaloneHost/Store/IArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "StoreInterface/EntryPaths.h"

#include <memory>
#include <string>
#include <utility>
#include <vector>

/// A store as an earlier version has kept it: basic objects of these names, numbered from 1, with a proximity group.
/// Neither is checked.
inline std::shared_ptr<Store::VStore> OpenOldStore(const std::vector<std::string>& names, const std::string& group)
{
  struct OldArchive final : Store::IArchive
  {
    Store::ChangeSet Load() override { return std::move(content); }
    NMX::IResult Keep(const Store::ChangeSet&, const Store::StoreState&) override { return NMX::EResult::Ok; }
    Store::ChangeSet content;
  };
  constexpr auto kind = NMX::ESubjectKind::BasicObjects;
  auto archive = std::make_unique<OldArchive>();
  std::uint64_t count = 0;
  for (const std::string& name : names)
  {
    const NMX::TSubjectStoreId id(++count);
    auto record = std::make_unique<Store::SubjectRecord>(id, kind, name);
    record->Set(*record->schema->Find(NMX::Paths::ProximityGroupName()), group);
    archive->content.subjects.emplace(id, Store::ChangedSubject{std::move(record), kind, 0x1F});
  }
  archive->content.nextId = NMX::TSubjectStoreId(++count);
  return NMX::MakeShared<Store::VStore>(std::move(archive));
}
