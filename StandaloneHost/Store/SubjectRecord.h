#pragma once

#include "StandaloneHost/Store/Schema.h"

#include <string>
#include <vector>

namespace Store
{

/// Everything the store keeps of one subject.
///
/// A look-up by name and the reading of a truth value, which nearly every call does, touch one cache line: the first,
/// with a short name's characters. Records lie densely in a pool of their own, apart from what hangs on them.
struct alignas(64) SubjectRecord
{
  /// A subject with the initial value of each entry of its kind.
  SubjectRecord(NMX::TSubjectStoreId subjectId, NMX::ESubjectKind subjectKind, std::string subjectName);

  [[nodiscard]] const std::string& Name() const { return std::get<std::string>(name); }
  [[nodiscard]] std::uint32_t Flags() const { return std::get<std::uint32_t>(values[CommonValue::flags]); }
  [[nodiscard]] NMX::TSubjectStoreId Parent() const
  {
    return std::get<NMX::TSubjectStoreId>(values[CommonValue::parent]);
  }
  /// The slot of its parent that the subject is in.
  [[nodiscard]] NMX::TSubjectStoreId ParentSlot() const
  {
    return std::get<NMX::TSubjectStoreId>(values[CommonValue::parentSlot]);
  }
  [[nodiscard]] const std::vector<NMX::TSubjectStoreId>& Children() const
  {
    return std::get<std::vector<NMX::TSubjectStoreId>>(values[CommonValue::children]);
  }

  /// The value of an entry of the record's kind.
  [[nodiscard]] const NMX::Value& Get(const SchemaEntry& entry) const
  {
    switch (entry.storage)
    {
    case EStorage::Bit:
      return truth[(bits >> entry.index) & 1U];
    case EStorage::Name:
      return name;
    case EStorage::Value:
      return values[entry.index];
    case EStorage::Group:
      break;
    }
    return nothing;
  }

  /// Writes an entry that is not a group; the value has the entry's type or is empty.
  void Set(const SchemaEntry& entry, NMX::Value value);

  static void* operator new(std::size_t size);
  static void operator delete(void* place, std::size_t size) noexcept;

  NMX::TSubjectStoreId id;
  std::uint64_t bits;
  const KindSchema* schema;
  NMX::Value name;
  std::vector<NMX::Value> values;
  NMX::ESubjectKind kind;
  NMX::ChangeStamps stamps{};

private:
  static const NMX::Value truth[2];
  static const NMX::Value nothing;
};

}
