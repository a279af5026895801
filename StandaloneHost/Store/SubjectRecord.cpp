#include "StandaloneHost/Store/SubjectRecord.h"

#include <utility>

namespace Store
{

SubjectRecord::SubjectRecord(NMX::TSubjectStoreId subjectId, NMX::ESubjectKind subjectKind, std::string subjectName)
    : id(subjectId), bits(KindSchema::Of(subjectKind).InitialBits()), kind(subjectKind), name(std::move(subjectName))
{
  const KindSchema& schema = KindSchema::Of(kind);
  values.resize(schema.ValueCount());
  for (const SchemaEntry& entry : schema.Entries())
    if (entry.storage == EStorage::Value)
      values[entry.index] = entry.initial;
  values[CommonValue::subjectId] = id;
}

const NMX::Value& SubjectRecord::Get(const SchemaEntry& entry) const
{
  static const NMX::Value truth[2] = {false, true};
  static const NMX::Value nothing;
  switch (entry.storage)
  {
  case EStorage::Name:
    return name;
  case EStorage::Bit:
    return truth[(bits >> entry.index) & 1U];
  case EStorage::Value:
    return values[entry.index];
  case EStorage::Group:
    break;
  }
  return nothing;
}

void SubjectRecord::Set(const SchemaEntry& entry, NMX::Value value)
{
  const std::uint64_t bit = std::uint64_t{1} << entry.index;
  switch (entry.storage)
  {
  case EStorage::Name:
    name = std::move(value);
    break;
  case EStorage::Bit:
    bits = std::get<bool>(value) ? bits | bit : bits & ~bit;
    break;
  case EStorage::Value:
    values[entry.index] = std::move(value);
    break;
  case EStorage::Group:
    break;
  }
}

}
