#pragma once

#include "StandaloneHost/Store/Schema.h"

#include <string>
#include <vector>

namespace Store
{

/// Everything the store keeps of one subject. The members that nearly every call reads stand first, together.
struct SubjectRecord
{
  /// A subject with the initial value of each entry of its kind.
  SubjectRecord(NMX::TSubjectStoreId subjectId, NMX::ESubjectKind subjectKind, std::string subjectName);

  [[nodiscard]] const std::string& Name() const { return std::get<std::string>(name); }
  [[nodiscard]] std::uint32_t Flags() const { return std::get<std::uint32_t>(values[CommonValue::flags]); }
  [[nodiscard]] NMX::TSubjectStoreId Parent() const
  {
    return std::get<NMX::TSubjectStoreId>(values[CommonValue::parent]);
  }
  [[nodiscard]] const std::vector<NMX::TSubjectStoreId>& Children() const
  {
    return std::get<std::vector<NMX::TSubjectStoreId>>(values[CommonValue::children]);
  }

  /// The value of an entry of the record's kind.
  [[nodiscard]] const NMX::Value& Get(const SchemaEntry& entry) const;

  /// Writes an entry that is not a group; the value has the entry's type or is empty.
  void Set(const SchemaEntry& entry, NMX::Value value);

  NMX::TSubjectStoreId id;
  std::uint64_t bits;
  NMX::ESubjectKind kind;
  NMX::Value name;
  std::vector<NMX::Value> values;
  NMX::ChangeStamps stamps{};
};

}
