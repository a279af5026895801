#pragma once

#include "StandaloneHost/Store/SubjectRecord.h"

#include <string>
#include <string_view>
#include <vector>

namespace Store
{

/// What can tie objects to each other, so that one's warnings depend on another.
enum class ELink : char
{
  ProximityGroup = 'P',
  TemplateGroup = 'T',
  Device = 'D',
  Pattern = 'M'
};

/// A link as the key of an index: objects with the same key are tied to each other.
[[nodiscard]] std::string LinkKey(ELink link, std::string_view name);

/// The key of a pattern that clusters of a type blink.
[[nodiscard]] std::string PatternKey(std::string_view clusterType, std::uint32_t pattern);

/// The keys of an object's groups, devices and patterns; none for any other subject.
[[nodiscard]] std::vector<std::string> LinksOf(const SubjectRecord& record);

[[nodiscard]] bool IsObject(const SubjectRecord& record);

/// The clusters of an object; none for a basic one.
[[nodiscard]] const std::vector<NMX::SmartCluster>& ClustersOf(const SubjectRecord& record);

/// The value of an entry of the record, empty when its kind has no such entry or it has another type.
template <class T>
[[nodiscard]] const T& Value(const SubjectRecord& record, NMX::EntryPath path)
{
  static const T none{};
  const SchemaEntry* entry = record.schema->Find(path);
  const T* value = entry != nullptr ? std::get_if<T>(&record.Get(*entry)) : nullptr;
  return value != nullptr ? *value : none;
}

}
