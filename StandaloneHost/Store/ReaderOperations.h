#pragma once

#include "StandaloneHost/Store/NameRule.h"
#include "StandaloneHost/Store/SubjectRecord.h"
#include "StoreInterface/IStoreReader.h"
#include "StoreInterface/SettingsPaths.h"

#include <algorithm>

namespace Store
{

/// The reading operations, the same for a reader and an editor. They differ in where they find a record: `Derived` has
/// Lookup(name) and Lookup(id), which answer a record or null.
template <class Derived, class Interface>
class ReaderOperations : public Interface
{
public:
  using Id = NMX::TSubjectStoreId;

  NMX::IResult FindByName(std::string_view name, Id& id) const override
  {
    const SubjectRecord* record = Self().Lookup(name);
    if (record == nullptr)
      return NMX::EResult::NotFound;
    // What is looked up by name is nearly always read next.
    m_latest = record;
    id = record->id;
    return NMX::EResult::Ok;
  }

  NMX::IResult ObjectKind(Id id, std::uint32_t& kind) const override
  {
    const SubjectRecord* record = Record(id);
    if (record == nullptr)
      return NMX::EResult::InvalidId;
    kind = record->Flags() & NMX::SubjectFlag::objectKindMask;
    return NMX::EResult::Ok;
  }

  NMX::IResult Kind(Id id, NMX::ESubjectKind& kind) const override
  {
    const SubjectRecord* record = Record(id);
    if (record == nullptr)
      return NMX::EResult::InvalidId;
    kind = record->kind;
    return NMX::EResult::Ok;
  }

  NMX::IResult Children(Id id, std::vector<Id>& ids) const override
  {
    const SubjectRecord* record = Record(id);
    if (record == nullptr)
      return NMX::EResult::InvalidId;
    ids = record->Children();
    return NMX::EResult::Ok;
  }

  NMX::IResult Descendants(Id id, std::vector<Id>& ids) const override
  {
    if (Record(id) == nullptr)
      return NMX::EResult::InvalidId;
    std::vector<Id> found{id};
    for (std::size_t next = 0; next < found.size(); ++next)
      if (const SubjectRecord* record = Record(found[next]))
        found.insert(found.end(), record->Children().begin(), record->Children().end());
    std::sort(found.begin(), found.end());
    ids = std::move(found);
    return NMX::EResult::Ok;
  }

  NMX::IResult Stamps(Id id, NMX::ChangeStamps& stamps) const override
  {
    const SubjectRecord* record = Record(id);
    if (record == nullptr)
      return NMX::EResult::InvalidId;
    stamps = record->stamps;
    return NMX::EResult::Ok;
  }

  NMX::IResult Find(Id id, NMX::EntryPath path, const NMX::Value*& value) const override
  {
    const SubjectRecord* record = Record(id);
    if (record == nullptr)
      return NMX::EResult::InvalidId;
    const SchemaEntry* entry = record->schema->Find(path);
    value = entry != nullptr ? &record->Get(*entry) : nullptr;
    return NMX::EResult::Ok;
  }

  [[nodiscard]] std::string NamePattern() const override
  {
    const NMX::Value* setting = Self().FindApplicationEntry(NMX::PathOf(NMX::ESetting::NameRegex));
    const auto* pattern = setting != nullptr ? std::get_if<std::string>(setting) : nullptr;
    return pattern != nullptr && !pattern->empty() ? *pattern : std::string(NameRule::pattern);
  }

protected:
  [[nodiscard]] const SubjectRecord* Record(Id id) const
  {
    if (m_latest != nullptr && m_latest->id == id)
      return m_latest;
    return m_latest = Self().Lookup(id);
  }

  /// To be called whenever records may have moved.
  void ForgetLatest() { m_latest = nullptr; }

private:
  [[nodiscard]] const Derived& Self() const { return static_cast<const Derived&>(*this); }

  mutable const SubjectRecord* m_latest = nullptr;
};

}
