#include "RunaCorePluginSubjectStore/SmartObjectServices/VSmartObjectServices.h"

#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/SmartObjectWarnings.h"
#include "RunaCorePluginSubjectStore/Subjects/Warnings.h"
#include "StoreInterface/WideText.h"

#include <filesystem>
#include <limits>
#include <utility>

namespace SmartObjectServices
{

using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

using Clusters = std::vector<NMX::SmartCluster>;

}

VSmartObjectServices::VSmartObjectServices(std::shared_ptr<NMX::IStore> store,
                                           std::shared_ptr<ISmartObjectControls> controls,
                                           std::shared_ptr<IFileLocations> locations)
    : ObjectServices(std::move(store), NMX::ESubjectKind::SmartObjects, Subjects::MustBeSmartObject),
      m_controls(std::move(controls)), m_locations(std::move(locations))
{
}

IResult VSmartObjectServices::SmartObjectList(std::set<std::string>& names) const
{
  return List(names);
}

/// The path of the default template; empty when the host has no place for templates.
std::string VSmartObjectServices::DefaultTemplate() const
{
  if (!m_locations)
    return {};
  const auto folders = m_locations->Directories(IFileLocations::smartObjectTemplates);
  if (folders.empty())
    return {};
  std::wstring path = folders.front();
  if (!path.empty() && path.back() != L'/')
    path += L'/';
  path += L"Corvex.sot";
  return NMX::ToUtf8(path).value_or(std::string{});
}

IResult VSmartObjectServices::Add(const std::string& name)
{
  return Subjects::Guarded([&] { return AddFromTemplate(name, DefaultTemplate()); });
}

IResult VSmartObjectServices::AddFromTemplate(const std::string& name, const std::string& templatePath)
{
  return Subjects::Guarded(
      [&]() -> IResult
      {
        if (!m_controls)
          return EResult::NotSupported;
        if (const IResult checked = Subjects::CheckNewName(name); checked.Failed())
          return checked;
        if (templatePath.size() > std::numeric_limits<std::int32_t>::max())
          return EResult::InvalidArgument;
        return m_controls->CreateFromTemplate(name, templatePath, ISmartObjectControls::ECreate::Yes);
      });
}

IResult VSmartObjectServices::CompatibleDeviceTypes(std::vector<std::string>& deviceTypes) const
{
  return Subjects::Guarded(
      [&]() -> IResult
      {
        deviceTypes = SmartObjectServices::CompatibleDeviceTypes();
        return EResult::Ok;
      });
}

IResult VSmartObjectServices::CreateSmartObjects()
{
  return Subjects::Guarded(
      [&]() -> IResult
      {
        std::vector<std::string> names;
        return m_controls ? m_controls->CreateForUnlinkedDevices(names) : EResult::NotSupported;
      });
}

IResult VSmartObjectServices::AssignOptimalActiveMarkerPatterns()
{
  return Subjects::Guarded([&]() -> IResult
                           { return m_controls ? m_controls->AssignOptimalPatterns() : EResult::NotSupported; });
}

IResult VSmartObjectServices::AutoPatternManagementEnabled(bool& enabled) const
{
  return Subjects::Guarded(
      [&]() -> IResult
      {
        const auto reader = Store().Reader();
        const NMX::Value* value = reader->FindApplicationEntry(Paths::AutoPatternManagement());
        const bool* set = value != nullptr ? std::get_if<bool>(value) : nullptr;
        enabled = set != nullptr && *set;
        return EResult::Ok;
      });
}

IResult VSmartObjectServices::SetAutoPatternManagementEnabled(bool enabled)
{
  return Subjects::Guarded(
      [&]() -> IResult
      {
        const auto editor = Store().Editor();
        if (const IResult written = editor->SetApplicationEntry(Paths::AutoPatternManagement(), enabled);
            written.Failed())
          return written;
        return editor->Commit();
      });
}

template <class Read>
IResult VSmartObjectServices::ReadCluster(const std::string& name, std::uint32_t index, Read read) const
{
  return Subjects::ReadSubject(Store(), name, Rule(),
                               [&](const NMX::IStoreReader& reader, TSubjectStoreId id) -> IResult
                               {
                                 Clusters clusters;
                                 if (const IResult found = NMX::Read(reader, id, Paths::SmartClusters(), clusters);
                                     found.Failed())
                                   return found;
                                 if (index >= clusters.size())
                                   return EResult::InvalidIndex;
                                 read(clusters[index]);
                                 return EResult::Ok;
                               });
}

/// `edit(access, cluster)` answers whether the cluster may become what it has made of it.
template <class Edit>
IResult VSmartObjectServices::EditCluster(const std::string& name, std::uint32_t index, Edit edit)
{
  return Subjects::EditSubject(
      Store(), name, Rule(),
      [&](NMX::IEntryEditor& editor, TSubjectStoreId id) -> IResult
      {
        Clusters clusters;
        if (const IResult found = NMX::Read(editor, id, Paths::SmartClusters(), clusters); found.Failed())
          return found;
        if (index >= clusters.size())
          return EResult::InvalidIndex;
        if (const IResult edited = edit(editor, clusters[index]); edited.Failed())
          return edited;
        return editor.SetValue(id, Paths::SmartClusters(), std::move(clusters), NMX::ENotify::Yes);
      });
}

IResult VSmartObjectServices::SmartClusterCount(const std::string& name, std::uint32_t& count) const
{
  return Subjects::ReadSubject(Store(), name, Rule(),
                               [&](const NMX::IStoreReader& reader, TSubjectStoreId id)
                               {
                                 Clusters clusters;
                                 const IResult read = NMX::Read(reader, id, Paths::SmartClusters(), clusters);
                                 if (read.Succeeded())
                                   count = static_cast<std::uint32_t>(clusters.size());
                                 return read;
                               });
}

IResult VSmartObjectServices::SmartClusterLabel(const std::string& name, std::uint32_t index, std::string& label) const
{
  return ReadCluster(name, index, [&](const NMX::SmartCluster& cluster) { label = cluster.label; });
}

IResult VSmartObjectServices::SetSmartClusterLabel(const std::string& name, std::uint32_t index,
                                                   const std::string& label)
{
  return EditCluster(name, index,
                     [&](const NMX::IStoreReader&, NMX::SmartCluster& cluster) -> IResult
                     {
                       cluster.label = label;
                       return EResult::Ok;
                     });
}

IResult VSmartObjectServices::SmartClusterActiveMarkerPattern(const std::string& name, std::uint32_t index,
                                                              std::uint32_t& pattern) const
{
  return ReadCluster(name, index, [&](const NMX::SmartCluster& cluster) { pattern = cluster.pattern; });
}

IResult VSmartObjectServices::SetSmartClusterActiveMarkerPattern(const std::string& name, std::uint32_t index,
                                                                 std::uint32_t pattern)
{
  return EditCluster(name, index,
                     [&](const NMX::IStoreReader& access, NMX::SmartCluster& cluster) -> IResult
                     {
                       cluster.pattern = pattern;
                       return m_controls ? m_controls->CheckPattern(access, cluster.type, pattern) : EResult::Ok;
                     });
}

IResult VSmartObjectServices::SmartClusterDeviceURN(const std::string& name, std::uint32_t index,
                                                    std::string& deviceUrn) const
{
  return ReadCluster(name, index, [&](const NMX::SmartCluster& cluster) { deviceUrn = cluster.deviceUrn; });
}

IResult VSmartObjectServices::SetSmartClusterDeviceURN(const std::string& name, std::uint32_t index,
                                                       const std::string& deviceUrn)
{
  return EditCluster(name, index,
                     [&](const NMX::IStoreReader&, NMX::SmartCluster& cluster) -> IResult
                     {
                       cluster.deviceUrn = deviceUrn;
                       return EResult::Ok;
                     });
}

IResult VSmartObjectServices::ActiveMarkersOnWhileCharging(const std::string& name, bool& onWhileCharging) const
{
  return Subjects::ReadEntry(Store(), name, Rule(), Paths::MarkersOnWhileCharging(), onWhileCharging);
}

IResult VSmartObjectServices::SetActiveMarkersOnWhileCharging(const std::string& name, bool onWhileCharging)
{
  return Subjects::WriteEntry(Store(), name, Rule(), Paths::MarkersOnWhileCharging(), onWhileCharging);
}

IResult VSmartObjectServices::SmartObjectWarnings(const std::string& name,
                                                  std::map<ESmartObjectWarning, std::string>& warnings) const
{
  static const Subjects::WarningEntries entries(NMX::smartObjectWarnings);
  return Subjects::ReadSubject(Store(), name, Rule(), [&](const NMX::IStoreReader& reader, TSubjectStoreId id)
                               { return entries.ReadActive(reader, id, warnings); });
}

std::shared_ptr<NMX::ISmartObjectServices::ChangedCallback> VSmartObjectServices::SmartObjectChangedCallback()
{
  return Changed();
}

}
