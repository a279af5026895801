#pragma once

#include "HostInterface/NMX/GlobalLog.h"
#include "StoreInterface/IStoreReader.h"

#include <utility>

namespace NMX
{

/// Reads an entry as a `T`. `NotFound` when the subject's kind has no such entry, `NotSet` when the entry is empty,
/// `InvalidType` when it holds something else; `value` is untouched then.
template <class T>
IResult Read(const IStoreReader& reader, TSubjectStoreId id, EntryPath path, T& value)
{
  const Value* found = nullptr;
  if (const IResult read = reader.Find(id, path, found); read.Failed())
    return read;
  if (found == nullptr)
  {
    Log(subjectStoreLog, ESeverity::Error, "Store entry '%1%' does not exist.", path);
    return EResult::NotFound;
  }
  if (std::holds_alternative<std::monostate>(*found))
  {
    Log(subjectStoreLog, ESeverity::Debug, "Store entry '%1%' has no value.", path);
    return EResult::NotSet;
  }
  const T* typed = std::get_if<T>(found);
  if (typed == nullptr)
    return EResult::InvalidType;
  value = *typed;
  return EResult::Ok;
}

}
