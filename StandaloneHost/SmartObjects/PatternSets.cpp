#include "StandaloneHost/SmartObjects/PatternSets.h"

#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

namespace SmartObjects
{

namespace
{

using NMX::EResult;
using NMX::IResult;
using Clusters = std::vector<NMX::SmartCluster>;

struct Object
{
  NMX::TSubjectStoreId id;
  Clusters clusters;
  bool changed = false;
};

/// Where the size of a type's set is kept.
std::string SetPath(std::string_view type)
{
  return "Application/SmartObjects/PatternSets/" + std::string(type);
}

}

std::uint32_t CurrentPatternSet(const NMX::IStoreReader& access, std::string_view type)
{
  const auto path = NMX::EntryPath::Known(SetPath(type));
  const NMX::Value* value = path ? access.FindApplicationEntry(*path) : nullptr;
  const auto* size = value != nullptr ? std::get_if<std::uint32_t>(value) : nullptr;
  const bool valid =
      size != nullptr && std::find(patternSetSizes.begin(), patternSetSizes.end(), *size) != patternSetSizes.end();
  return valid ? *size : patternSetSizes.front();
}

IResult AssignPatterns(NMX::IEntryEditor& editor)
{
  std::vector<NMX::TSubjectStoreId> ids;
  if (const IResult listed = editor.Subjects(NMX::ESubjectKind::SmartObjects, ids); listed.Failed())
    return listed;
  std::vector<Object> objects;
  std::string type;
  std::size_t count = 0;
  for (const NMX::TSubjectStoreId id : ids)
  {
    Object& object = objects.emplace_back(Object{id, {}});
    if (const IResult read = NMX::Read(editor, id, NMX::Paths::SmartClusters(), object.clusters); read.Failed())
      return read;
    for (const NMX::SmartCluster& cluster : object.clusters)
    {
      if (count++ > 0 && cluster.type != type)
        return EResult::NotSupported;
      type = cluster.type;
    }
  }
  if (count == 0)
    return EResult::Ok;

  const auto enough = std::find_if(patternSetSizes.begin(), patternSetSizes.end(),
                                   [count](std::uint32_t size) { return size >= count; });
  const std::uint32_t size = enough != patternSetSizes.end() ? *enough : patternSetSizes.back();
  std::vector<bool> taken(size + 1, false);
  for (Object& object : objects)
    for (NMX::SmartCluster& cluster : object.clusters)
    {
      const bool keeps = cluster.pattern != 0 && cluster.pattern <= size && !taken[cluster.pattern];
      if (keeps)
        taken[cluster.pattern] = true;
      else if (std::exchange(cluster.pattern, 0U) != 0)
        object.changed = true;
    }
  std::uint32_t next = 1;
  for (Object& object : objects)
    for (NMX::SmartCluster& cluster : object.clusters)
    {
      if (cluster.pattern != 0)
        continue;
      while (next <= size && taken[next])
        ++next;
      if (next > size)
        continue;
      cluster.pattern = next++;
      object.changed = true;
    }

  for (Object& object : objects)
    if (object.changed)
      if (const IResult written = editor.SetValue(object.id, NMX::Paths::SmartClusters(), std::move(object.clusters));
          written.Failed())
        return written;
  if (size == CurrentPatternSet(editor, type))
    return EResult::Ok;
  return editor.SetApplicationEntry(NMX::EntryPath(SetPath(type)), size);
}

}
