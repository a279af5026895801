#include "SubjectStoreUI/VSubjectModelInternalData.h"

#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/WideText.h"
#include "SubjectStoreUI/SubjectGadgets.h"
#include "SubjectStoreUI/SubjectsModelRole.h"
#include "SubjectStoreUI/WarningTypes.h"

#include <algorithm>
#include <map>
#include <string>
#include <utility>

namespace SubjectStoreUI
{

namespace Paths = NMX::Paths;
namespace Role = SubjectsModelRole;
using NMX::TSubjectStoreId;

namespace
{

/// The value of an entry that has one of type `T`; null otherwise, without a word: most kinds lack most entries.
template <class T>
const T* Find(const NMX::IStoreReader& access, TSubjectStoreId subject, NMX::EntryPath path)
{
  const NMX::Value* value = nullptr;
  return access.Find(subject, path, value).Succeeded() && value != nullptr ? std::get_if<T>(value) : nullptr;
}

QVariant ToVariant(bool value)
{
  return value;
}

QVariant ToVariant(std::uint32_t value)
{
  return value;
}

QVariant ToVariant(std::int32_t value)
{
  return value;
}

QVariant ToVariant(const std::string& value)
{
  return QString::fromStdString(value);
}

QVariant ToVariant(const std::wstring& value)
{
  return QString::fromStdWString(value);
}

template <class T>
QVariant Entry(const NMX::IStoreReader& access, TSubjectStoreId subject, NMX::EntryPath path)
{
  const T* value = Find<T>(access, subject, path);
  return value != nullptr ? ToVariant(*value) : QVariant{};
}

/// The numbers of the roles that the subject has.
QVariant Roles(const NMX::IStoreReader& access, TSubjectStoreId subject)
{
  QVariantList roles;
  int number = 0;
  for (const NMX::EntryPath& path : {Paths::RoleLabelling(), Paths::RoleSolving(), Paths::RoleRetargeting()})
  {
    const bool* has = Find<bool>(access, subject, path);
    if (has != nullptr && *has)
      roles.append(number);
    ++number;
  }
  return roles;
}

const std::vector<NMX::SmartCluster>* Clusters(const NMX::IStoreReader& access, TSubjectStoreId subject)
{
  return Find<std::vector<NMX::SmartCluster>>(access, subject, Paths::SmartClusters());
}

/// The devices that the clusters are linked to, in the clusters' order; empty texts for clusters without one.
QVariant DeviceNames(const NMX::IStoreReader& access, TSubjectStoreId subject)
{
  const auto* clusters = Clusters(access, subject);
  if (clusters == nullptr)
    return {};
  QStringList names;
  for (const NMX::SmartCluster& cluster : *clusters)
    names.append(QString::fromStdString(cluster.deviceUrn));
  return names;
}

QVariant Patterns(const NMX::IStoreReader& access, TSubjectStoreId subject)
{
  const auto* clusters = Clusters(access, subject);
  if (clusters == nullptr)
    return {};
  QVariantList patterns;
  for (const NMX::SmartCluster& cluster : *clusters)
    patterns.append(cluster.pattern);
  return patterns;
}

QVariant Markers(const NMX::IStoreReader& access, TSubjectStoreId subject)
{
  using Positions = std::vector<NMX::Position>;
  const Positions* markers = Find<Positions>(access, subject, Paths::Markers());
  if (markers == nullptr)
    markers = Find<Positions>(access, subject, Paths::AdditionalMarkerPositions());
  if (markers == nullptr)
    return {};
  QVariantList places;
  for (const NMX::Position& marker : *markers)
  {
    VPositionGadget place;
    place.x = marker.x;
    place.y = marker.y;
    place.z = marker.z;
    places.append(QVariant::fromValue(place));
  }
  return places;
}

/// The store entry of each warning type, by its id; the group has none.
const std::vector<NMX::EntryPath>& WarningPaths()
{
  static const std::vector<NMX::EntryPath> paths = []
  {
    std::vector<NMX::EntryPath> made;
    for (const WarningType& type : WarningTypes())
      made.emplace_back(made.empty() ? std::string("Warnings") : "Warnings/" + std::string(type.key));
    return made;
  }();
  return paths;
}

}

VSubjectModelInternalData::VSubjectModelInternalData(std::shared_ptr<NMX::IStore> store,
                                                     std::weak_ptr<NMX::IPostalService> gui)
    : m_store(std::move(store)), m_gui(std::move(gui))
{
}

ISubjectModelInternalData::ReadAccess VSubjectModelInternalData::OpenRead() const
{
  return m_store->Reader();
}

ISubjectModelInternalData::WriteAccess VSubjectModelInternalData::OpenWrite()
{
  return m_store->Editor();
}

std::vector<TSubjectStoreId> VSubjectModelInternalData::Subjects(const NMX::IStoreReader& access,
                                                                 std::span<const NMX::ESubjectKind> kinds) const
{
  std::vector<TSubjectStoreId> subjects;
  for (const NMX::ESubjectKind kind : kinds.empty() ? std::span<const NMX::ESubjectKind>(NMX::allSubjectKinds) : kinds)
  {
    std::vector<TSubjectStoreId> ofKind;
    if (access.Subjects(kind, ofKind).Failed() || ofKind.empty())
      continue;
    std::vector<TSubjectStoreId> merged(subjects.size() + ofKind.size());
    std::merge(subjects.begin(), subjects.end(), ofKind.begin(), ofKind.end(), merged.begin());
    subjects = std::move(merged);
  }
  return subjects;
}

std::vector<TSubjectStoreId> VSubjectModelInternalData::Children(const NMX::IStoreReader& access,
                                                                 TSubjectStoreId subject) const
{
  std::vector<TSubjectStoreId> children;
  (void)access.Children(subject, children);
  return children;
}

std::vector<SlotContent> VSubjectModelInternalData::Slots(const NMX::IStoreReader& access,
                                                          TSubjectStoreId character) const
{
  std::vector<SlotContent> contents;
  const auto* slots = Find<std::vector<NMX::Slot>>(access, character, Paths::Slots());
  if (slots == nullptr)
    return contents;
  std::map<TSubjectStoreId, TSubjectStoreId> occupants;
  for (const TSubjectStoreId child : Children(access, character))
    if (const auto* slot = Find<TSubjectStoreId>(access, child, Paths::ParentSubjectSlotId()))
      occupants.emplace(*slot, child);
  std::map<TSubjectStoreId, bool> known;
  for (const NMX::Slot& slot : *slots)
  {
    // Rows are told apart by their slots' ids.
    if (!slot.id.Valid() || !known.emplace(slot.id, true).second)
      continue;
    const auto occupant = occupants.find(slot.id);
    contents.push_back({slot.id, occupant != occupants.end() ? occupant->second : TSubjectStoreId{},
                        QString::fromStdString(slot.name)});
  }
  return contents;
}

QVariant VSubjectModelInternalData::Value(const NMX::IStoreReader& access, TSubjectStoreId subject, int role) const
{
  switch (role)
  {
  case Role::SubjectName:
    return Entry<std::string>(access, subject, Paths::Name());
  case Role::SubjectFlags:
    return Entry<std::uint32_t>(access, subject, Paths::Flags());
  case Role::SubjectRoles:
    return Roles(access, subject);
  case Role::SubjectEnabled:
    return Entry<bool>(access, subject, Paths::Enabled());
  case Role::SubjectSettingsPreset:
    return Entry<std::string>(access, subject, Paths::PresetName());
  case Role::SubjectFilePath:
    return Entry<std::wstring>(access, subject, Paths::FilePath());
  case Role::SubjectWarnings:
  {
    QVariantList types;
    for (const int type : Warnings(access, subject))
      types.append(type);
    return types;
  }
  case Role::SubjectSmartClusterDeviceNames:
    return DeviceNames(access, subject);
  case Role::SubjectCalibration:
    return Entry<std::int32_t>(access, subject, Paths::Calibration());
  case Role::SubjectPatterns:
    return Patterns(access, subject);
  case Role::SubjectIsAutoAssignable:
    return Entry<bool>(access, subject, Paths::AutoAssignEnabled());
  case Role::SubjectLinkedCameraURN:
    return Entry<std::string>(access, subject, Paths::LinkedCameraURN());
  case Role::SubjectTrackWithObjectTracker:
    return Entry<bool>(access, subject, Paths::TrackWithObjectTracker());
  case Role::SubjectSmartAndBasicMarkers:
    return Markers(access, subject);
  default:
    return {};
  }
}

std::vector<int> VSubjectModelInternalData::Warnings(const NMX::IStoreReader& access, TSubjectStoreId subject) const
{
  std::vector<int> types;
  const auto& paths = WarningPaths();
  for (std::size_t type = 1; type < paths.size(); ++type)
    if (const bool* holds = Find<bool>(access, subject, paths[type]); holds != nullptr && *holds)
      types.push_back(static_cast<int>(type));
  return types;
}

NMX::IResult VSubjectModelInternalData::SetEnabled(NMX::IEntryEditor& access, TSubjectStoreId subject, bool enabled)
{
  return access.SetValue(subject, Paths::Enabled(), enabled);
}

NMX::IResult VSubjectModelInternalData::Rename(NMX::IEntryEditor& access, TSubjectStoreId subject, const QString& name,
                                               NMX::ENotify notify)
{
  return access.Rename(subject, name.toStdString(), notify);
}

std::shared_ptr<const void> VSubjectModelInternalData::OnChange(std::function<void()> handler)
{
  auto subscriptions = std::make_shared<std::vector<NMX::Subscription>>();
  for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
    subscriptions->push_back(m_store->SubjectsChanged(kind)->Subscribe(m_gui, handler));
  return subscriptions;
}

}
