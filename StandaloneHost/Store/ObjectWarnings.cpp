#include "StandaloneHost/Store/ObjectWarnings.h"

#include "StandaloneHost/Store/ObjectLinks.h"
#include "StoreInterface/EntryPaths.h"

#include <algorithm>
#include <map>
#include <set>
#include <string>
#include <unordered_map>
#include <unordered_set>

namespace Store
{

namespace
{

using Id = NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

constexpr std::string_view devices = "Application/Devices/";
constexpr std::string_view processing = "Application/Settings/Processing/";

/// The bits of the warnings that are derived here.
struct Bits
{
  using Mask = std::uint64_t;

  static Mask Of(const char* warning)
  {
    const NMX::EntryPath path(std::string("Warnings/Warning") + warning);
    return Mask{1} << KindSchema::Of(NMX::ESubjectKind::SmartObjects).Find(path)->index;
  }

  const Mask duplicateDevice = Of("DuplicateDevice");
  const Mask duplicatePattern = Of("DuplicatePattern");
  const Mask noPattern = Of("NoPattern");
  const Mask disconnectedDevice = Of("DisconnectedDevice");
  const Mask missingDevice = Of("MissingDevice");
  const Mask deviceNotLinked = Of("DeviceNotLinked");
  const Mask activeMarkersOff = Of("ActiveMarkersOff");
  const Mask missingUnique = Of("ProximityGroupMissingUnique");
  const Mask duplicateTemplates = Of("ProximityGroupDuplicateTemplates");
  const Mask noProximityGroup = Of("TemplateGroupNoProximityGroup");
  const Mask nonIdentical = Of("TemplateGroupNonIdentical");
  const Mask processingNotEnabled = Of("TemplateGroupProcessingNotEnabled");
  const Mask ofDevices = duplicateDevice | disconnectedDevice | missingDevice | deviceNotLinked | activeMarkersOff;
  const Mask ofPatterns = duplicatePattern | noPattern;
  const Mask ofProximityGroups = missingUnique | duplicateTemplates;
  const Mask ofTemplateGroups = noProximityGroup | nonIdentical | processingNotEnabled;
  const Mask all = ofDevices | ofPatterns | ofProximityGroups | ofTemplateGroups;

  static const Bits& Instance()
  {
    static const Bits bits;
    return bits;
  }
};

bool Enabled(const SubjectRecord& record)
{
  return Value<bool>(record, Paths::Enabled());
}

const std::string& TemplateGroup(const SubjectRecord& record)
{
  return Value<std::string>(record, Paths::TemplateGroupName());
}

const std::string& ProximityGroup(const SubjectRecord& record)
{
  return Value<std::string>(record, Paths::ProximityGroupName());
}

bool Identical(const SubjectRecord& one, const SubjectRecord& other)
{
  using Positions = std::vector<NMX::Position>;
  const auto sameType = [](const NMX::SmartCluster& left, const NMX::SmartCluster& right)
  { return left.type == right.type; };
  return one.kind == other.kind &&
         Value<Positions>(one, Paths::Markers()) == Value<Positions>(other, Paths::Markers()) &&
         Value<Positions>(one, Paths::AdditionalMarkerPositions()) ==
             Value<Positions>(other, Paths::AdditionalMarkerPositions()) &&
         std::equal(ClustersOf(one).begin(), ClustersOf(one).end(), ClustersOf(other).begin(), ClustersOf(other).end(),
                    sameType);
}

/// Works the warnings out, with what it learns of a group kept for the group's other members.
class Deriver
{
public:
  explicit Deriver(Draft& draft) : m_draft(draft) {}

  void RunForTouched()
  {
    FindTouched();
    Run();
  }

  void RunForAll()
  {
    TouchAll(All);
    Run();
  }

private:
  void Run()
  {
    for (const auto& [id, aspects] : m_touched)
    {
      const SubjectRecord* record = m_draft.Find(id);
      if (record == nullptr)
        continue;
      std::uint64_t wanted = record->bits & m_bits.all;
      const auto derive = [&](unsigned aspect, std::uint64_t bits, auto warnings)
      {
        if ((aspects & aspect) != 0)
          wanted = (wanted & ~bits) | (this->*warnings)(*record);
      };
      derive(Devices, m_bits.ofDevices, &Deriver::DeviceWarnings);
      derive(Patterns, m_bits.ofPatterns, &Deriver::PatternWarnings);
      derive(ProximityGroups, m_bits.ofProximityGroups, &Deriver::ProximityGroupWarnings);
      derive(TemplateGroups, m_bits.ofTemplateGroups, &Deriver::TemplateGroupWarnings);
      if ((record->bits & m_bits.all) != wanted)
      {
        SubjectRecord& changed = m_draft.Change(id, NMX::EAspect::Warnings);
        changed.bits = (changed.bits & ~m_bits.all) | wanted;
      }
    }
  }

  /// What of an object may be others: its warnings of…
  enum Aspect : unsigned
  {
    Devices = 1,
    Patterns = 2,
    ProximityGroups = 4,
    TemplateGroups = 8,
    All = 15
  };

  static unsigned AspectOf(const std::string& key)
  {
    switch (static_cast<ELink>(key.front()))
    {
    case ELink::Device:
      return Devices;
    case ELink::Pattern:
      return Patterns;
    case ELink::ProximityGroup:
      return ProximityGroups;
    case ELink::TemplateGroup:
      return TemplateGroups;
    }
    return All;
  }

  /// The objects that have a link as the edit leaves them.
  template <class Visit>
  void ForEachLinked(const std::string& key, Visit visit)
  {
    for (const Id id : m_draft.Base().Linked(key))
      if (!m_changed.contains(id))
        visit(*m_draft.Base().Find(id));
    if (const auto changed = m_changedLinks.find(key); changed != m_changedLinks.end())
      for (const Id id : changed->second)
        visit(*m_draft.Find(id));
  }

  void FindTouched()
  {
    std::unordered_set<std::string> keys;
    for (const auto& [id, change] : m_draft.Changes().subjects)
    {
      const SubjectRecord* before = m_draft.Base().Find(id);
      const SubjectRecord* now = change.record.get();
      if (!IsObject(now != nullptr ? *now : *before))
        continue;
      m_changed.insert(id);
      const bool matters = before == nullptr || now == nullptr || MayMatter(*before, *now);
      if (before != nullptr && matters)
        for (std::string& key : LinksOf(*before))
          keys.insert(std::move(key));
      if (now == nullptr)
        continue;
      for (std::string& key : LinksOf(*now))
      {
        m_changedLinks[key].push_back(id);
        if (matters)
          keys.insert(std::move(key));
      }
      if (matters)
        m_touched[id] = All;
    }
    bool all = false;
    for (const auto& [path, value] : m_draft.Changes().applicationEntries)
    {
      std::string_view text = path.Text();
      all = all || text.starts_with(processing);
      if (!text.starts_with(devices))
        continue;
      text.remove_prefix(devices.size());
      keys.insert(LinkKey(ELink::Device, text.substr(0, text.rfind('/'))));
    }
    for (const std::string& key : keys)
      ForEachLinked(key, [&](const SubjectRecord& record) { m_touched[record.id] |= AspectOf(key); });
    if (all)
      TouchAll(TemplateGroups);
  }

  void TouchAll(unsigned aspects)
  {
    for (const NMX::ESubjectKind kind : {NMX::ESubjectKind::BasicObjects, NMX::ESubjectKind::SmartObjects})
      for (const Id id : m_draft.Subjects(kind))
        m_touched[id] |= aspects;
  }

  /// Whether a change of an object can change its warnings or another's.
  bool MayMatter(const SubjectRecord& before, const SubjectRecord& now) const
  {
    return Enabled(before) != Enabled(now) || (before.bits & m_bits.all) != (now.bits & m_bits.all) ||
           ProximityGroup(before) != ProximityGroup(now) || TemplateGroup(before) != TemplateGroup(now) ||
           ClustersOf(before) != ClustersOf(now) || !Identical(before, now) ||
           Value<bool>(before, Paths::MarkersOnWhileCharging()) != Value<bool>(now, Paths::MarkersOnWhileCharging());
  }

  /// An entry of a device; null when the device is not known.
  const NMX::Value* DeviceEntry(const std::string& urn, std::string_view entry) const
  {
    const auto path = NMX::EntryPath::Known(std::string(devices) + urn + '/' + std::string(entry));
    return path ? m_draft.FindApplicationEntry(*path) : nullptr;
  }

  bool DeviceIs(const std::string& urn, std::string_view state) const
  {
    const NMX::Value* value = DeviceEntry(urn, state);
    const bool* holds = value != nullptr ? std::get_if<bool>(value) : nullptr;
    return holds != nullptr && *holds;
  }

  std::uint64_t DeviceWarnings(const SubjectRecord& record)
  {
    std::uint64_t warnings = 0;
    for (const NMX::SmartCluster& cluster : ClustersOf(record))
    {
      if (cluster.deviceUrn.empty())
      {
        warnings |= m_bits.deviceNotLinked;
        continue;
      }
      if (Users(cluster.deviceUrn) > 1)
        warnings |= m_bits.duplicateDevice;
      if (DeviceEntry(cluster.deviceUrn, "Type") == nullptr)
        warnings |= m_bits.missingDevice;
      else if (!DeviceIs(cluster.deviceUrn, "Connected"))
        warnings |= m_bits.disconnectedDevice;
      if (DeviceIs(cluster.deviceUrn, "Charging") && !Value<bool>(record, Paths::MarkersOnWhileCharging()))
        warnings |= m_bits.activeMarkersOff;
    }
    return warnings;
  }

  std::uint64_t PatternWarnings(const SubjectRecord& record)
  {
    std::uint64_t warnings = 0;
    if (!Enabled(record))
      return warnings;
    for (const NMX::SmartCluster& cluster : ClustersOf(record))
    {
      if (cluster.pattern == 0)
        warnings |= m_bits.noPattern;
      else if (Blinkers(PatternKey(cluster.type, cluster.pattern)) > 1)
        warnings |= m_bits.duplicatePattern;
    }
    return warnings;
  }

  std::uint64_t ProximityGroupWarnings(const SubjectRecord& record)
  {
    const std::string& group = ProximityGroup(record);
    if (!Enabled(record) || group.empty())
      return 0;
    const auto [known, unknown] = m_proximityGroups.try_emplace(group, 0);
    if (!unknown)
      return known->second;
    bool unique = false;
    bool duplicates = false;
    std::set<std::string_view> templates;
    ForEachLinked(LinkKey(ELink::ProximityGroup, group),
                  [&](const SubjectRecord& member)
                  {
                    if (!Enabled(member))
                      return;
                    if (TemplateGroup(member).empty())
                      unique = true;
                    else
                      duplicates = !templates.insert(TemplateGroup(member)).second || duplicates;
                  });
    return known->second = (unique ? 0 : m_bits.missingUnique) | (duplicates ? m_bits.duplicateTemplates : 0);
  }

  std::uint64_t TemplateGroupWarnings(const SubjectRecord& record)
  {
    const std::string& group = TemplateGroup(record);
    if (!Enabled(record) || group.empty())
      return 0;
    const auto [known, unknown] = m_templateGroups.try_emplace(group, 0);
    if (unknown)
      ForEachLinked(LinkKey(ELink::TemplateGroup, group),
                    [&](const SubjectRecord& member)
                    {
                      if (Enabled(member) && !Identical(member, record))
                        known->second = m_bits.nonIdentical;
                    });
    return known->second | (ProximityGroup(record).empty() ? m_bits.noProximityGroup : 0) |
           (ProcessesTemplateGroups() ? 0 : m_bits.processingNotEnabled);
  }

  /// How many objects are linked to a device.
  std::size_t Users(const std::string& urn)
  {
    const auto [known, unknown] = m_users.try_emplace(urn, 0);
    if (unknown)
      ForEachLinked(LinkKey(ELink::Device, urn), [&](const SubjectRecord&) { ++known->second; });
    return known->second;
  }

  /// How many enabled objects blink a pattern.
  std::size_t Blinkers(const std::string& key)
  {
    const auto [known, unknown] = m_blinkers.try_emplace(key, 0);
    if (unknown)
      ForEachLinked(key, [&](const SubjectRecord& record) { known->second += Enabled(record) ? 1 : 0; });
    return known->second;
  }

  /// Proximity grouping is on unless it was switched off; object instance tracking is off unless it was switched on.
  bool ProcessesTemplateGroups() const
  {
    const auto setting = [&](const char* name, bool otherwise)
    {
      const auto path = NMX::EntryPath::Known(std::string(processing) + name);
      const NMX::Value* value = path ? m_draft.FindApplicationEntry(*path) : nullptr;
      const bool* set = value != nullptr ? std::get_if<bool>(value) : nullptr;
      return set != nullptr ? *set : otherwise;
    };
    return setting("ProximityGrouping", true) || setting("ObjectInstanceTracking", false);
  }

  const Bits& m_bits = Bits::Instance();
  Draft& m_draft;
  std::set<Id> m_changed;           // objects that the edit changes
  std::map<Id, unsigned> m_touched; // objects whose warnings may be others, and which of them
  // Hashed: long texts that begin alike are slow to put in order.
  std::unordered_map<std::string, std::vector<Id>> m_changedLinks; // by their links as the edit leaves them
  std::unordered_map<std::string, std::uint64_t> m_proximityGroups;
  std::unordered_map<std::string, std::uint64_t> m_templateGroups;
  std::unordered_map<std::string, std::size_t> m_users;
  std::unordered_map<std::string, std::size_t> m_blinkers;
};

}

void DeriveObjectWarnings(Draft& draft)
{
  Deriver(draft).RunForTouched();
}

void DeriveAllObjectWarnings(Draft& draft)
{
  Deriver(draft).RunForAll();
}

}
