#include "RunaCorePluginSubjectStore/Subjects/ClusterEdits.h"

#include "RunaCorePluginSubjectStore/Subjects/SubjectAccess.h"
#include "StoreInterface/EntryPaths.h"

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

namespace Subjects
{

using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

using Clusters = std::vector<NMX::SmartCluster>;

bool AllSmart(const NMX::IStoreReader& access, std::span<const TSubjectStoreId> objects)
{
  return std::all_of(objects.begin(), objects.end(),
                     [&](TSubjectStoreId id) { return MustBeSmartObject(access, id).Succeeded(); });
}

std::size_t ClusterCount(const NMX::IStoreReader& access, TSubjectStoreId object)
{
  Clusters clusters;
  return NMX::Read(access, object, Paths::SmartClusters(), clusters).Succeeded() ? clusters.size() : 0;
}

bool HasLabel(const Clusters& clusters, const std::string& label)
{
  return std::any_of(clusters.begin(), clusters.end(),
                     [&](const NMX::SmartCluster& cluster) { return cluster.label == label; });
}

/// Adds a subject of the first free name: `wanted`, or else `wanted` with a number.
IResult AddNumbered(NMX::IEntryEditor& editor, const std::string& wanted, const std::string& otherwise,
                    TSubjectStoreId& id)
{
  IResult added = editor.Add(NMX::ESubjectKind::SmartObjects, wanted, id);
  for (int number = 2; added.Failed() && number < 10000; ++number)
  {
    if (added != EResult::AlreadyPresent && added != EResult::InvalidName)
      return added;
    added = editor.Add(NMX::ESubjectKind::SmartObjects, otherwise + ' ' + std::to_string(number), id);
  }
  return added;
}

/// Copies an entry that both have.
IResult CopyEntry(NMX::IEntryEditor& editor, TSubjectStoreId from, TSubjectStoreId to, NMX::EntryPath path)
{
  const NMX::Value* value = nullptr;
  if (const IResult found = editor.Find(from, path, value); found.Failed() || value == nullptr)
    return found;
  return editor.SetValue(to, path, NMX::Value(*value), NMX::ENotify::Yes);
}

IResult SplitOne(NMX::IEntryEditor& editor, TSubjectStoreId object)
{
  Clusters clusters;
  if (const IResult read = NMX::Read(editor, object, Paths::SmartClusters(), clusters); read.Failed())
    return read;
  if (clusters.size() < 2)
    return EResult::Ok;
  std::string name;
  if (const IResult read = NMX::Read(editor, object, Paths::Name(), name); read.Failed())
    return read;
  const Clusters others(clusters.begin() + 1, clusters.end());
  clusters.resize(1);
  if (const IResult set = editor.SetValue(object, Paths::SmartClusters(), std::move(clusters)); set.Failed())
    return set;
  for (const NMX::SmartCluster& cluster : others)
  {
    TSubjectStoreId made;
    if (const IResult added = AddNumbered(editor, name + ' ' + cluster.label, name, made); added.Failed())
      return added;
    if (const IResult set = editor.SetValue(made, Paths::SmartClusters(), Clusters{cluster}); set.Failed())
      return set;
    for (const NMX::EntryPath& path :
         {Paths::ColourRGBA(), Paths::ProximityGroupName(), Paths::TemplateGroupName(), Paths::Enabled()})
      if (const IResult copied = CopyEntry(editor, object, made, path); copied.Failed())
        return copied;
  }
  return EResult::Ok;
}

}

IResult CheckMerge(const NMX::IStoreReader& access, std::span<const TSubjectStoreId> objects)
{
  return objects.size() >= 2 && AllSmart(access, objects) ? EResult::Ok : EResult::InvalidArgument;
}

IResult Merge(NMX::IEntryEditor& editor, std::span<const TSubjectStoreId> objects)
{
  if (const IResult checked = CheckMerge(editor, objects); checked.Failed())
    return checked;
  Clusters merged;
  for (const TSubjectStoreId object : objects)
  {
    Clusters clusters;
    if (const IResult read = NMX::Read(editor, object, Paths::SmartClusters(), clusters); read.Failed())
      return read;
    for (NMX::SmartCluster& cluster : clusters)
    {
      const std::string label = cluster.label;
      for (int number = 2; HasLabel(merged, cluster.label); ++number)
        cluster.label = label + ' ' + std::to_string(number);
      merged.push_back(std::move(cluster));
    }
    if (object == objects.front())
      continue;
    if (const IResult removed = editor.Remove(object); removed.Failed())
      return removed;
  }
  return editor.SetValue(objects.front(), Paths::SmartClusters(), std::move(merged));
}

IResult CheckSplit(const NMX::IStoreReader& access, std::span<const TSubjectStoreId> objects)
{
  const auto hasMore = [&](TSubjectStoreId id) { return ClusterCount(access, id) > 1; };
  return AllSmart(access, objects) && std::any_of(objects.begin(), objects.end(), hasMore) ? EResult::Ok
                                                                                           : EResult::InvalidArgument;
}

IResult Split(NMX::IEntryEditor& editor, std::span<const TSubjectStoreId> objects)
{
  if (const IResult checked = CheckSplit(editor, objects); checked.Failed())
    return checked;
  for (const TSubjectStoreId object : objects)
    if (const IResult split = SplitOne(editor, object); split.Failed())
      return split;
  return EResult::Ok;
}

IResult CheckSwap(const NMX::IStoreReader& access, TSubjectStoreId first, TSubjectStoreId second)
{
  const std::size_t needed = first == second ? 2 : 1;
  const auto fits = [&](TSubjectStoreId id)
  { return MustBeSmartObject(access, id).Succeeded() && ClusterCount(access, id) >= needed; };
  return fits(first) && fits(second) ? EResult::Ok : EResult::InvalidArgument;
}

IResult Swap(NMX::IEntryEditor& editor, TSubjectStoreId first, std::uint32_t firstIndex, TSubjectStoreId second,
             std::uint32_t secondIndex)
{
  if (const IResult checked = CheckSwap(editor, first, second); checked.Failed())
    return checked;
  Clusters ofFirst;
  Clusters ofSecond;
  if (const IResult read = NMX::Read(editor, first, Paths::SmartClusters(), ofFirst); read.Failed())
    return read;
  if (const IResult read = NMX::Read(editor, second, Paths::SmartClusters(), ofSecond); read.Failed())
    return read;
  if (firstIndex >= ofFirst.size() || secondIndex >= ofSecond.size())
    return EResult::InvalidIndex;
  if (first == second)
    std::swap(ofFirst[firstIndex], ofFirst[secondIndex]);
  else
  {
    std::swap(ofFirst[firstIndex], ofSecond[secondIndex]);
    if (const IResult set = editor.SetValue(second, Paths::SmartClusters(), std::move(ofSecond)); set.Failed())
      return set;
  }
  return editor.SetValue(first, Paths::SmartClusters(), std::move(ofFirst));
}

}
