#include "StandaloneHost/Store/ObjectLinks.h"

#include "StoreInterface/EntryPaths.h"

#include <algorithm>

namespace Store
{

std::string LinkKey(ELink link, std::string_view name)
{
  std::string key;
  key.reserve(name.size() + 1);
  key += static_cast<char>(link);
  key += name;
  return key;
}

std::string PatternKey(std::string_view clusterType, std::uint32_t pattern)
{
  return LinkKey(ELink::Pattern, std::to_string(pattern) + '/' + std::string(clusterType));
}

bool IsObject(const SubjectRecord& record)
{
  return record.kind == NMX::ESubjectKind::BasicObjects || record.kind == NMX::ESubjectKind::SmartObjects;
}

const std::vector<NMX::SmartCluster>& ClustersOf(const SubjectRecord& record)
{
  return Value<std::vector<NMX::SmartCluster>>(record, NMX::Paths::SmartClusters());
}

std::vector<std::string> LinksOf(const SubjectRecord& record)
{
  std::vector<std::string> links;
  if (!IsObject(record))
    return links;
  if (const auto& group = Value<std::string>(record, NMX::Paths::ProximityGroupName()); !group.empty())
    links.push_back(LinkKey(ELink::ProximityGroup, group));
  if (const auto& group = Value<std::string>(record, NMX::Paths::TemplateGroupName()); !group.empty())
    links.push_back(LinkKey(ELink::TemplateGroup, group));
  for (const NMX::SmartCluster& cluster : ClustersOf(record))
  {
    if (!cluster.deviceUrn.empty())
      links.push_back(LinkKey(ELink::Device, cluster.deviceUrn));
    if (cluster.pattern != 0)
      links.push_back(PatternKey(cluster.type, cluster.pattern));
  }
  std::sort(links.begin(), links.end());
  links.erase(std::unique(links.begin(), links.end()), links.end());
  return links;
}

}
