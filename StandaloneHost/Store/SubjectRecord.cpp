#include "StandaloneHost/Store/SubjectRecord.h"

#include <memory_resource>
#include <utility>

namespace Store
{

namespace
{

/// Never destroyed: records may outlive every static object.
std::pmr::memory_resource& Pool()
{
  static auto* const pool = new std::pmr::synchronized_pool_resource;
  return *pool;
}

}

const NMX::Value SubjectRecord::truth[2] = {false, true};
const NMX::Value SubjectRecord::nothing;

void* SubjectRecord::operator new(std::size_t size)
{
  return Pool().allocate(size, alignof(SubjectRecord));
}

void SubjectRecord::operator delete(void* place, std::size_t size) noexcept
{
  Pool().deallocate(place, size, alignof(SubjectRecord));
}

SubjectRecord::SubjectRecord(NMX::TSubjectStoreId subjectId, NMX::ESubjectKind subjectKind, std::string subjectName)
    : id(subjectId), schema(&KindSchema::Of(subjectKind)), name(std::move(subjectName)), kind(subjectKind)
{
  bits = schema->InitialBits();
  values.resize(schema->ValueCount());
  for (const SchemaEntry& entry : schema->Entries())
    if (entry.storage == EStorage::Value)
      values[entry.index] = entry.initial;
  values[CommonValue::subjectId] = id;
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
