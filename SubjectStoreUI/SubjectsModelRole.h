#pragma once

#include <QByteArray>
#include <QHash>
#include <QList>

#include <array>
#include <string_view>

namespace SubjectStoreUI
{

/// The name of a role with that key: without a trailing "Role" and an "E" before a capital, and with a small first
/// letter.
[[nodiscard]] QByteArray RoleName(std::string_view key);

/// The names of roles by their numbers, from a table of keys.
template <class Keys>
[[nodiscard]] QHash<int, QByteArray> RoleNames(const Keys& keys)
{
  QHash<int, QByteArray> names;
  for (const auto& key : keys)
    names.insert(key.role, RoleName(key.text));
  return names;
}

/// What the models of subjects tell of a row.
namespace SubjectsModelRole
{

enum ERole : int
{
  SubjectStoreId = Qt::UserRole + 1,
  SubjectName,
  SubjectFlags,
  SubjectRoles,
  SubjectEnabled,
  SubjectSettingsPreset,
  SubjectFilePath,
  SubjectSelectionItem,
  SubjectWarnings,
  SubjectSmartClusterDeviceNames,
  SubjectCalibration,
  SubjectIsSlot,
  SubjectSlotName,
  SubjectSlotShortName,
  SubjectPatterns,
  SubjectHasParent,
  SubjectIsAutoAssignable,
  SubjectLinkedCameraURN,
  SubjectTrackWithObjectTracker,
  SubjectSmartAndBasicMarkers,
  SubjectProxySortName,
  SubjectIsSubjectElement
};

struct Key
{
  ERole role;
  std::string_view text;
};

/// Every role with its key, in ascending order.
inline constexpr std::array keys{Key{SubjectStoreId, "SubjectStoreId"},
                                 Key{SubjectName, "SubjectName"},
                                 Key{SubjectFlags, "SubjectFlags"},
                                 Key{SubjectRoles, "SubjectRoles"},
                                 Key{SubjectEnabled, "SubjectEnabled"},
                                 Key{SubjectSettingsPreset, "SubjectSettingsPreset"},
                                 Key{SubjectFilePath, "SubjectFilePath"},
                                 Key{SubjectSelectionItem, "SubjectSelectionItem"},
                                 Key{SubjectWarnings, "SubjectWarnings"},
                                 Key{SubjectSmartClusterDeviceNames, "SubjectSmartClusterDeviceNames"},
                                 Key{SubjectCalibration, "SubjectCalibration"},
                                 Key{SubjectIsSlot, "SubjectIsSlot"},
                                 Key{SubjectSlotName, "SubjectSlotName"},
                                 Key{SubjectSlotShortName, "SubjectSlotShortName"},
                                 Key{SubjectPatterns, "SubjectPatterns"},
                                 Key{SubjectHasParent, "SubjectHasParent"},
                                 Key{SubjectIsAutoAssignable, "SubjectIsAutoAssignable"},
                                 Key{SubjectLinkedCameraURN, "SubjectLinkedCameraURN"},
                                 Key{SubjectTrackWithObjectTracker, "SubjectTrackWithObjectTracker"},
                                 Key{SubjectSmartAndBasicMarkers, "SubjectSmartAndBasicMarkers"},
                                 Key{SubjectProxySortName, "SubjectProxySortName"},
                                 Key{SubjectIsSubjectElement, "SubjectIsSubjectElement"}};

static_assert(keys.front().role == 257 && keys.back().role == 278);

/// All of them, for a change that may have touched any.
[[nodiscard]] const QList<int>& All();

/// The name by which QML knows each.
[[nodiscard]] const QHash<int, QByteArray>& Names();

}

}
