#include "StandaloneHost/Store/Schema.h"

#include "StoreInterface/EntryPaths.h"

#include <array>
#include <string>

namespace Store
{

namespace
{

using NMX::EAspect;
using NMX::ESubjectKind;
using NMX::EValueType;
using NMX::Value;
namespace Paths = NMX::Paths;

using KindMask = unsigned;

constexpr KindMask Only(ESubjectKind kind)
{
  return 1U << static_cast<unsigned>(kind);
}

constexpr KindMask all = 0xFF;
constexpr KindMask basic = Only(ESubjectKind::BasicObjects);
constexpr KindMask smart = Only(ESubjectKind::SmartObjects);
constexpr KindMask character = Only(ESubjectKind::CharactersFromClusters);
constexpr KindMask general = Only(ESubjectKind::GeneralSubjects);
constexpr KindMask cluster = Only(ESubjectKind::LabellingClusters);
constexpr KindMask markerless = Only(ESubjectKind::Markerless);
constexpr KindMask mesh = Only(ESubjectKind::SceneMeshes);

/// One entry, and the kinds that have it.
struct Row
{
  KindMask kinds;
  NMX::EntryPath path;
  EValueType type;
  Value initial;
  EAspect aspect = EAspect::Parameters;
  EWriter writer = EWriter::Anyone;
};

Row Group(KindMask kinds, NMX::EntryPath path)
{
  return {kinds, path, EValueType::Nothing, {}, EAspect::Parameters, EWriter::StoreOnly};
}

constexpr std::array warningNames{
    "DuplicateDevice",
    "DuplicatePattern",
    "NoPattern",
    "EmptySlot",
    "CFCChildWarning",
    "DisconnectedDevice",
    "MissingDevice",
    "DeviceNotLinked",
    "DuplicateCluster",
    "NotCalibrated",
    "ProximityGroupMissingUnique",
    "ProximityGroupDuplicateTemplates",
    "TemplateGroupNoProximityGroup",
    "TemplateGroupNonIdentical",
    "TemplateGroupProcessingNotEnabled",
    "CFCNoReferenceClusterAssigned",
    "InsufficientAutoAssignCandidates",
    "ObjectConfusion",
    "ObjectConfusionCritical",
    "ActiveMarkersOff",
    "BadSync",
    "BatteryCritical",
    "BatteryLow",
    "BatteryRecharging",
    "ConnectionIssue",
    "FirmwareIssue",
    "HasPendingCommands",
    "NoRadioChannel",
    "PreferredMasterConflict",
    "RadioConflict",
};

/// Every entry of every kind. The first five values are those of CommonValue, in its order; the warnings come last.
std::vector<Row> Rows()
{
  const Value noId = NMX::TSubjectStoreId{};
  std::vector<Row> rows{
      {all, Paths::SubjectId(), EValueType::SubjectId, noId, EAspect::Parameters, EWriter::StoreOnly},
      {all, Paths::Flags(), EValueType::UInt32, 0U},
      {all, Paths::ParentSubjectId(), EValueType::SubjectId, noId},
      {all, Paths::ParentSubjectSlotId(), EValueType::SubjectId, noId},
      {all, Paths::Children(), EValueType::SubjectIds, std::vector<NMX::TSubjectStoreId>{}, EAspect::Parameters,
       EWriter::StoreOnly},
      {all, Paths::Name(), EValueType::Text, std::string{}, EAspect::Parameters, EWriter::StoreOnly},
      {all, Paths::Enabled(), EValueType::Bool, true},
      Group(all, Paths::Parameters()),
      Group(all, Paths::Roles()),
      Group(all, Paths::Warnings()),

      {basic | smart, Paths::AutoAssignedName(), EValueType::Text, {}},
      {basic | smart, Paths::AutoAssignEnabled(), EValueType::Bool, false},
      {basic | smart | cluster, Paths::ColourRGBA(), EValueType::Colour, NMX::Colour{}},
      {basic | smart, Paths::EntranceThreshold(), EValueType::UInt32, 0U},
      {basic | general | cluster | mesh, Paths::FilePath(), EValueType::WideText, {}},
      {basic | smart | cluster, Paths::PresetName(), EValueType::Text, std::string{}},
      {basic | smart, Paths::ProximityGroupName(), EValueType::Text, std::string{}},
      {basic | smart, Paths::RootSegmentName(), EValueType::Text, std::string{}},
      {basic | smart, Paths::TemplateGroupName(), EValueType::Text, std::string{}},
      {character | general | markerless, Paths::Calibration(), EValueType::Int32, 0},
      {character | general | markerless, Paths::Retarget(), EValueType::WideText, std::wstring{}},
      {character | general | markerless, Paths::ReloadRetargetAction(), EValueType::Action, NMX::Action{}},
      {cluster, Paths::LinkedCameraURN(), EValueType::Text, std::string{}},
      {cluster, Paths::TrackWithObjectTracker(), EValueType::Bool, false},

      {basic | general | cluster | markerless | mesh, Paths::RoleLabelling(), EValueType::Bool, true},
      {character | general | markerless, Paths::RoleRetargeting(), EValueType::Bool, false},
      {character | general, Paths::RoleSolving(), EValueType::Bool, true},

      Group(smart, Paths::SmartObject()),
      {smart, Paths::AdditionalMarkerPositions(), EValueType::Positions, std::vector<NMX::Position>{},
       EAspect::Markers},
      {smart, Paths::MarkersOnWhileCharging(), EValueType::Bool, false},
      {smart, Paths::SkinName(), EValueType::Text, std::string{}},
      {smart, Paths::SmartClusters(), EValueType::SmartClusters, std::vector<NMX::SmartCluster>{},
       EAspect::SmartClusters},
      {basic, Paths::Markers(), EValueType::Positions, std::vector<NMX::Position>{}, EAspect::Markers},
      {character, Paths::Slots(), EValueType::Slots, std::vector<NMX::Slot>{}},

      Group(general, Paths::ModelOutputs()),
      {general, Paths::ModelOutputCGM2(), EValueType::Bool, false, EAspect::ModelOutputs},
      {general, Paths::ModelOutputPluginKinex(), EValueType::Bool, false, EAspect::ModelOutputs},
  };
  for (const char* name : warningNames)
    rows.push_back({all, NMX::EntryPath::Constant(std::string("Warnings/Warning") + name), EValueType::Bool, false,
                    EAspect::Warnings});
  return rows;
}

/// A record has one word of truth values for all kinds alike; the warnings are its highest bits.
constexpr unsigned wordSize = 64;
constexpr unsigned firstWarningBit = wordSize - warningNames.size();

}

KindSchema::KindSchema(ESubjectKind kind)
{
  unsigned bit = 0;
  for (Row& row : Rows())
  {
    // Bits are counted over all kinds, values within the kind.
    if (bit < firstWarningBit && row.aspect == EAspect::Warnings)
      bit = firstWarningBit;
    const unsigned rowBit = row.type == EValueType::Bool ? bit++ : 0;
    if ((row.kinds & Only(kind)) == 0)
      continue;

    SchemaEntry entry{row.path, row.type, row.aspect, EStorage::Value, row.writer, 0, std::move(row.initial)};
    if (row.path == Paths::Name())
      entry.storage = EStorage::Name;
    else if (row.path == Paths::Flags())
      entry.initial = NMX::KindFlags(kind);
    if (row.type == EValueType::Nothing)
      entry.storage = EStorage::Group;
    else if (row.type == EValueType::Bool)
    {
      entry.storage = EStorage::Bit;
      entry.index = static_cast<std::uint8_t>(rowBit);
      if (std::get<bool>(entry.initial))
        m_initialBits |= std::uint64_t{1} << rowBit;
    }
    if (entry.storage == EStorage::Value)
      entry.index = static_cast<std::uint8_t>(m_valueCount++);

    if (m_byPath.size() <= row.path.Number())
      m_byPath.resize(row.path.Number() + 1);
    m_entries.push_back(std::move(entry));
    m_byPath[row.path.Number()] = static_cast<std::uint8_t>(m_entries.size());
  }
}

const KindSchema& KindSchema::Of(ESubjectKind kind)
{
  static const std::array<KindSchema, NMX::allSubjectKinds.size()> schemas{
      KindSchema(ESubjectKind::BasicObjects),
      KindSchema(ESubjectKind::SmartObjects),
      KindSchema(ESubjectKind::CharactersFromClusters),
      KindSchema(ESubjectKind::GeneralSubjects),
      KindSchema(ESubjectKind::LabellingClusters),
      KindSchema(ESubjectKind::Markerless),
      KindSchema(ESubjectKind::Props),
      KindSchema(ESubjectKind::SceneMeshes)};
  return schemas[static_cast<std::size_t>(kind)];
}

std::uint64_t KindSchema::WarningBits()
{
  return ~std::uint64_t{0} << firstWarningBit;
}

std::uint64_t KindSchema::CharacterBit(NMX::EntryPath path)
{
  return std::uint64_t{1} << Of(ESubjectKind::CharactersFromClusters).Find(path)->index;
}

}
