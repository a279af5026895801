#include "StandaloneHost/SmartObjects/VSmartObjectControls.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Files/ReadResult.h"
#include "StandaloneHost/SmartObjects/PatternSets.h"
#include "StandaloneHost/SmartObjects/TemplateFile.h"
#include "StandaloneHost/Store/NameRule.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TryToAdd.h"
#include "StoreInterface/TypedAccess.h"

#include <algorithm>
#include <set>
#include <utility>

namespace SmartObjects
{

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using NMX::TSubjectStoreId;

namespace
{

using Clusters = std::vector<NMX::SmartCluster>;

/// The type of device that smart objects can be made for.
constexpr std::string_view supportedType = "Corvex1";

struct Device
{
  std::string urn;
  std::string type;
};

/// The devices of the stage, in the order of their URNs.
std::vector<Device> Devices(const NMX::IStoreReader& access)
{
  constexpr std::string_view prefix = "Application/Devices/";
  constexpr std::string_view suffix = "/Type";
  std::vector<Device> devices;
  for (const NMX::EntryPath& path : access.ApplicationEntries(NMX::EntryPath("Application/Devices")))
  {
    const std::string_view text = path.Text();
    if (!text.ends_with(suffix) || text.size() <= prefix.size() + suffix.size())
      continue;
    const auto* type = std::get_if<std::string>(access.FindApplicationEntry(path));
    devices.push_back({std::string(text.substr(prefix.size(), text.size() - prefix.size() - suffix.size())),
                       type != nullptr ? *type : std::string{}});
  }
  return devices;
}

/// Visits every cluster of the smart objects: `visit(cluster)`.
template <class Visit>
IResult ForEachCluster(const NMX::IStoreReader& access, Visit visit)
{
  std::vector<TSubjectStoreId> ids;
  if (const IResult listed = access.Subjects(ESubjectKind::SmartObjects, ids); listed.Failed())
    return listed;
  for (const TSubjectStoreId id : ids)
  {
    Clusters clusters;
    if (const IResult read = NMX::Read(access, id, NMX::Paths::SmartClusters(), clusters); read.Failed())
      return read;
    std::for_each(clusters.begin(), clusters.end(), visit);
  }
  return EResult::Ok;
}

/// Gives the clusters of new objects patterns of the present sets that no other cluster has. When there are too few,
/// every cluster is given one of a larger set, if one serves them all.
IResult GivePatterns(NMX::IEntryEditor& editor, const std::vector<TSubjectStoreId>& objects)
{
  std::set<std::pair<std::string, std::uint32_t>> taken;
  if (const IResult visited = ForEachCluster(editor, [&](const NMX::SmartCluster& cluster)
                                             { taken.emplace(cluster.type, cluster.pattern); });
      visited.Failed())
    return visited;
  bool enough = true;
  for (const TSubjectStoreId id : objects)
  {
    Clusters clusters;
    if (const IResult read = NMX::Read(editor, id, NMX::Paths::SmartClusters(), clusters); read.Failed())
      return read;
    for (NMX::SmartCluster& cluster : clusters)
    {
      const std::uint32_t size = CurrentPatternSet(editor, cluster.type);
      std::uint32_t pattern = 1;
      while (pattern <= size && taken.contains({cluster.type, pattern}))
        ++pattern;
      enough = enough && pattern <= size;
      if (pattern > size)
        continue;
      cluster.pattern = pattern;
      taken.emplace(cluster.type, pattern);
    }
    if (const IResult set = editor.SetValue(id, NMX::Paths::SmartClusters(), std::move(clusters)); set.Failed())
      return set;
  }
  const IResult assigned = enough ? EResult::Ok : AssignPatterns(editor);
  return assigned == EResult::NotSupported ? EResult::Ok : assigned; // then some stay without
}

/// Adds a smart object whose clusters have no patterns yet.
IResult AddObject(NMX::IEntryEditor& editor, const std::string& name, Clusters clusters,
                  std::vector<NMX::Position> additionalMarkers, TSubjectStoreId& id)
{
  if (const IResult added = editor.Add(ESubjectKind::SmartObjects, name, id); added.Failed())
    return added;
  if (const IResult set = editor.SetValue(id, NMX::Paths::SmartClusters(), std::move(clusters)); set.Failed())
    return set;
  return editor.SetValue(id, NMX::Paths::AdditionalMarkerPositions(), std::move(additionalMarkers));
}

/// Reads a template. `FileNotFound`, or `Failed` with the reason in the log.
IResult ReadTemplateFile(const std::filesystem::path& file, const DeviceLayouts& layouts,
                         std::shared_ptr<const SmartObjectTemplate>& content)
{
  const IResult read = Files::Read<&ReadTemplate>("smart object template", file, content);
  if (read.Failed())
    return read == EResult::FileNotFound || file.empty() ? EResult::FileNotFound : EResult::Failed;
  for (const ClusterTemplate& cluster : content->clusters)
    if (!layouts.Known(cluster.type))
    {
      Files::ReportUnusable("smart object template",
                            file.string() + ": there is no device type " + Files::Quoted(cluster.type));
      return EResult::Failed;
    }
  return EResult::Ok;
}

/// A name for the object of a device: the URN, or the type with a number.
std::string NameFor(NMX::IEntryEditor& editor, const Device& device)
{
  TSubjectStoreId known;
  std::string name = device.urn;
  for (int number = 1; editor.FindByName(name, known).Succeeded() || !Store::NameRule::Allows(name); ++number)
    name = device.type + ' ' + std::to_string(number);
  return name;
}

/// Adds a smart object for each of the devices and gives it a pattern.
IResult AddForDevices(NMX::IEntryEditor& editor, const std::vector<Device>& devices, std::vector<std::string>& names)
{
  std::set<std::string> types;
  std::set<std::uint32_t> patterns;
  if (const IResult visited = ForEachCluster(editor,
                                             [&](const NMX::SmartCluster& cluster)
                                             {
                                               types.insert(cluster.type);
                                               if (cluster.pattern != 0)
                                                 patterns.insert(cluster.pattern);
                                             });
      visited.Failed())
    return visited;
  for (const Device& device : devices)
    if (device.type != supportedType)
    {
      NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error,
               "No smart object can be made for device \"%1%\" of type \"%2%\"", device.urn, device.type);
      return EResult::NotFound;
    }
  types.emplace(supportedType);
  if (types.size() > 1)
    return EResult::NotSupported;
  if (devices.size() > patternSetSizes.back() - std::min<std::size_t>(patterns.size(), patternSetSizes.back()))
    return EResult::AllocationFailure;

  std::vector<TSubjectStoreId> objects;
  for (const Device& device : devices)
  {
    names.push_back(NameFor(editor, device));
    if (const IResult added =
            AddObject(editor, names.back(), {{"Cluster", device.urn, 0, device.type}}, {}, objects.emplace_back());
        added.Failed())
      return added;
  }
  return GivePatterns(editor, objects);
}

}

VSmartObjectControls::VSmartObjectControls(std::shared_ptr<NMX::IStore> store,
                                           std::shared_ptr<const DeviceLayouts> layouts)
    : m_store(std::move(store)), m_layouts(std::move(layouts))
{
}

IResult VSmartObjectControls::CreateFromTemplate(const std::string& name, const std::filesystem::path& file,
                                                 ECreate create)
{
  if (file.native().find('\0') != std::filesystem::path::string_type::npos)
    return EResult::InvalidArgument;
  // A name that cannot be given is told first, and no edit is open while the file is read: it can take its time.
  if (const IResult possible = NMX::TryToAdd(*m_store, ESubjectKind::SmartObjects, name); possible.Failed())
    return possible;
  std::shared_ptr<const SmartObjectTemplate> content;
  if (const IResult read = ReadTemplateFile(file, *m_layouts, content); read.Failed())
    return read;
  Clusters clusters;
  for (const ClusterTemplate& cluster : content->clusters)
    clusters.push_back({cluster.label, {}, 0, cluster.type});

  const auto editor = m_store->Editor();
  TSubjectStoreId id;
  if (const IResult added = AddObject(*editor, name, std::move(clusters), content->additionalMarkers, id);
      added.Failed())
    return added;
  if (const IResult given = GivePatterns(*editor, {id}); given.Failed())
    return given;
  return create == ECreate::Yes ? editor->Commit() : EResult::Ok;
}

IResult VSmartObjectControls::CreateForUnlinkedDevices(std::vector<std::string>& names)
{
  const auto editor = m_store->Editor();
  std::set<std::string> linked;
  if (const IResult visited =
          ForEachCluster(*editor, [&](const NMX::SmartCluster& cluster) { linked.insert(cluster.deviceUrn); });
      visited.Failed())
    return visited;
  std::vector<Device> devices = Devices(*editor);
  std::erase_if(devices, [&](const Device& device) { return linked.contains(device.urn); });
  if (devices.empty())
    return EResult::Ok;
  std::vector<std::string> made;
  if (const IResult added = AddForDevices(*editor, devices, made); added.Failed())
    return added;
  const IResult kept = editor->Commit();
  if (kept.Succeeded())
    names = std::move(made);
  return kept;
}

IResult VSmartObjectControls::CreateForDevices(const std::vector<std::string>& urns, ECreate create,
                                               std::vector<std::string>& names)
{
  if (urns.empty())
    return EResult::InvalidArgument;
  const auto editor = m_store->Editor();
  std::set<std::string> taken;
  if (const IResult visited =
          ForEachCluster(*editor, [&](const NMX::SmartCluster& cluster) { taken.insert(cluster.deviceUrn); });
      visited.Failed())
    return visited;
  const std::vector<Device> known = Devices(*editor);
  std::vector<Device> devices;
  for (const std::string& urn : urns)
  {
    const auto device =
        std::find_if(known.begin(), known.end(), [&](const Device& candidate) { return candidate.urn == urn; });
    if (device == known.end())
      return EResult::NotFound;
    if (!taken.insert(urn).second)
      return EResult::AlreadyPresent;
    devices.push_back(*device);
  }
  std::vector<std::string> made;
  if (const IResult added = AddForDevices(*editor, devices, made); added.Failed())
    return added;
  const IResult kept = create == ECreate::Yes ? editor->Commit() : EResult::Ok;
  if (kept.Succeeded())
    names = std::move(made);
  return kept;
}

IResult VSmartObjectControls::AssignOptimalPatterns()
{
  const auto editor = m_store->Editor();
  if (const IResult known = CheckTypes(*editor); known.Failed())
    return known;
  if (const IResult assigned = AssignPatterns(*editor); assigned.Failed())
    return assigned;
  return editor->Commit();
}

IResult VSmartObjectControls::CheckTypes(const NMX::IStoreReader& access) const
{
  bool known = true;
  const IResult visited = ForEachCluster(access, [&](const NMX::SmartCluster& cluster)
                                         { known = known && m_layouts->Known(cluster.type); });
  return visited.Failed() || known ? visited : EResult::NotFound;
}

IResult VSmartObjectControls::CheckPattern(const NMX::IStoreReader& access, const std::string& clusterType,
                                           std::uint32_t pattern) const
{
  return pattern <= CurrentPatternSet(access, clusterType) ? EResult::Ok : EResult::InvalidValue;
}

}
