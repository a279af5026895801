#include "StandaloneHost/Store/CharacterSlots.h"

#include "StandaloneHost/Store/ObjectLinks.h"
#include "StoreInterface/CalibrationState.h"
#include "StoreInterface/EntryPaths.h"

#include <boost/unordered/unordered_flat_map.hpp>

#include <algorithm>
#include <map>
#include <string>
#include <utility>

namespace Store
{

namespace
{

using Id = NMX::TSubjectStoreId;
using Slots = std::vector<NMX::Slot>;
namespace Paths = NMX::Paths;

/// The bits of the warnings that are derived here.
struct Bits
{
  const std::uint64_t enabled = KindSchema::CharacterBit(Paths::Enabled());
  const std::uint64_t emptySlot = KindSchema::CharacterBit(Paths::WarningEmptySlot());
  const std::uint64_t onObject = KindSchema::CharacterBit(Paths::WarningCFCChildWarning());
  const std::uint64_t notCalibrated = KindSchema::CharacterBit(Paths::WarningNotCalibrated());
  const std::uint64_t noReference = KindSchema::CharacterBit(Paths::WarningCFCNoReferenceClusterAssigned());
  const std::uint64_t tooFewObjects = KindSchema::CharacterBit(Paths::WarningInsufficientAutoAssignCandidates());
  const std::uint64_t derived = emptySlot | onObject | notCalibrated | noReference | tooFewObjects;

  static const Bits& Instance()
  {
    static const Bits bits;
    return bits;
  }
};

using Positions = boost::unordered_flat_map<Id, std::size_t, std::hash<Id>>;

/// Where the slots stand, by their ids.
Positions PositionsOf(const Slots& slots)
{
  Positions positions;
  for (std::size_t position = 0; position < slots.size(); ++position)
    if (slots[position].id.Valid())
      positions.emplace(slots[position].id, position);
  return positions;
}

bool IsCharacter(const SubjectRecord* record)
{
  return record != nullptr && record->kind == NMX::ESubjectKind::CharactersFromClusters;
}

/// A set of the committed state as the edit leaves it, in ascending order: what the edit changed is asked again. Ids
/// that were handed out may be changed meanwhile.
template <class Holds>
class CurrentIds
{
public:
  CurrentIds(const Draft& draft, const std::set<Id>& committed, Holds holds)
      : m_draft(draft), m_next(committed.begin()), m_end(committed.end())
  {
    for (const auto& [id, change] : draft.Changes().subjects)
      if (change.record != nullptr && holds(*change.record))
        m_changed.push_back(id);
    std::reverse(m_changed.begin(), m_changed.end());
    SkipChanged();
  }

  [[nodiscard]] bool Empty() const { return m_next == m_end && m_changed.empty(); }

  /// There is one left.
  Id TakeFirst()
  {
    if (m_next == m_end || (!m_changed.empty() && m_changed.back() < *m_next))
    {
      const Id id = m_changed.back();
      m_changed.pop_back();
      return id;
    }
    const Id id = *m_next++;
    SkipChanged();
    return id;
  }

private:
  void SkipChanged()
  {
    while (m_next != m_end && m_draft.Changes().subjects.contains(*m_next))
      ++m_next;
  }

  const Draft& m_draft;
  std::set<Id>::const_iterator m_next;
  const std::set<Id>::const_iterator m_end;
  std::vector<Id> m_changed; // descending
};

class Deriver
{
public:
  Deriver(Draft& draft, bool autoAssign) : m_draft(draft), m_autoAssign(autoAssign) {}

  void RunForTouched()
  {
    const auto touch = [&](Id id)
    {
      if (IsCharacter(m_draft.Find(id)))
        m_characters.insert(id);
    };
    // A character that a subject left was changed by that.
    for (const auto& [id, change] : m_draft.Changes().subjects)
    {
      touch(id);
      if (change.record == nullptr)
        continue;
      touch(change.record->Parent());
      if (IsObject(*change.record))
        m_objects.push_back(id);
    }
    TellOfChangedSlots();
    Run();
  }

  void RunForAll()
  {
    for (const Id id : m_draft.Subjects(NMX::ESubjectKind::CharactersFromClusters))
      m_characters.insert(id);
    for (const NMX::ESubjectKind kind : {NMX::ESubjectKind::BasicObjects, NMX::ESubjectKind::SmartObjects})
      for (const Id id : m_draft.Subjects(kind))
        m_objects.push_back(id);
    Run();
  }

private:
  void Run()
  {
    for (const Id id : m_characters)
      SettleSlots(id);
    if (m_autoAssign)
      FillSlots();
    for (const Id id : m_characters)
    {
      DeriveWarnings(id);
      NameObjects(id);
    }
    for (const Id id : m_objects)
      ReleaseUnlessInSlot(id);
  }

  /// A character shows what its objects are called and which slots they are in: it changes with them.
  void TellOfChangedSlots()
  {
    for (const Id id : m_objects)
    {
      const SubjectRecord& now = *m_draft.Find(id);
      const SubjectRecord* before = m_draft.Base().Find(id);
      if (before != nullptr && IsCharacter(m_draft.Find(now.Parent())) &&
          (now.Name() != before->Name() || now.ParentSlot() != before->ParentSlot()))
        m_draft.Change(now.Parent(), NMX::EAspect::Parameters);
    }
  }

  /// Sees to it that a slot holds one subject, and answers the empty ones in their order.
  std::vector<Id> SettleSlots(Id id)
  {
    const SubjectRecord& character = *m_draft.Find(id);
    auto positions = PositionsOf(Value<Slots>(character, Paths::Slots()));
    for (const Id child : character.Children())
    {
      const Id claimed = m_draft.Find(child)->ParentSlot();
      if (claimed.Valid() && positions.erase(claimed) == 0)
        m_draft.MoveUnder(child, id);
    }
    std::map<std::size_t, Id> inOrder;
    for (const auto& [slot, position] : positions)
      inOrder.emplace(position, slot);
    std::vector<Id> empty;
    for (const auto& [position, slot] : inOrder)
      empty.push_back(slot);
    SetBits(id, m_bits.emptySlot, empty.empty() ? 0 : m_bits.emptySlot);
    return empty;
  }

  void FillSlots()
  {
    CurrentIds characters(m_draft, m_draft.Base().AwaitingObjects(), AwaitsObjects);
    if (characters.Empty())
      return;
    CurrentIds objects(m_draft, m_draft.Base().AutoAssignable(), IsAutoAssignable);
    std::vector<Id> passedOver; // objects that a character could not have
    while (!characters.Empty() && !(objects.Empty() && passedOver.empty()))
    {
      const Id character = characters.TakeFirst();
      const Id root = RootOf(character);
      for (const Id slot : SettleSlots(character))
        if (const Id object = TakeOther(root, passedOver, objects); object.Valid())
          m_draft.MoveUnder(object, character, slot);
      SettleSlots(character);
      m_characters.insert(character);
    }
  }

  /// What a subject is beneath, at the top.
  [[nodiscard]] Id RootOf(Id id) const
  {
    while (m_draft.Find(id)->Parent().Valid())
      id = m_draft.Find(id)->Parent();
    return id;
  }

  /// The first object that may be assigned, other than `root`: what a character is beneath cannot come beneath it. The
  /// invalid id when there is none.
  template <class Objects>
  static Id TakeOther(Id root, std::vector<Id>& passedOver, Objects& objects)
  {
    const auto first = std::find_if(passedOver.begin(), passedOver.end(), [root](Id id) { return id != root; });
    if (first != passedOver.end())
    {
      const Id id = *first;
      passedOver.erase(first);
      return id;
    }
    while (!objects.Empty())
    {
      const Id id = objects.TakeFirst();
      if (id != root)
        return id;
      passedOver.push_back(id);
    }
    return {};
  }

  void DeriveWarnings(Id id)
  {
    const SubjectRecord& character = *m_draft.Find(id);
    bool warned = false;
    bool referenced = false;
    for (const Id child : character.Children())
    {
      const SubjectRecord& object = *m_draft.Find(child);
      warned = warned || (object.bits & KindSchema::WarningBits()) != 0;
      referenced = referenced || (IsObject(object) && object.ParentSlot().Valid() && !AutoAssigned(object));
    }
    std::uint64_t warnings = character.bits & m_bits.emptySlot;
    if (warned)
      warnings |= m_bits.onObject;
    if (Value<std::int32_t>(character, Paths::Calibration()) != NMX::CalibrationState::done)
      warnings |= m_bits.notCalibrated;
    if (m_autoAssign && !referenced)
      warnings |= m_bits.noReference;
    // Every object that could be assigned has been.
    if (m_autoAssign && AwaitsObjects(character))
      warnings |= m_bits.tooFewObjects;
    SetBits(id, m_bits.derived, warnings);
  }

  void NameObjects(Id id)
  {
    const SubjectRecord& character = *m_draft.Find(id);
    const Slots& slots = Value<Slots>(character, Paths::Slots());
    const auto positions = PositionsOf(slots);
    for (const Id child : character.Children())
    {
      const SubjectRecord& object = *m_draft.Find(child);
      const auto slot = positions.find(object.ParentSlot());
      if (IsObject(object) && slot != positions.end())
        SetAutoAssignedName(object, m_autoAssign && AutoAssigned(object) ? &slots[slot->second].name : nullptr);
    }
  }

  /// Slots are those of characters; whatever else an object claims to be in is none.
  void ReleaseUnlessInSlot(Id id)
  {
    const SubjectRecord& object = *m_draft.Find(id);
    const bool inSlot = object.ParentSlot().Valid() && IsCharacter(m_draft.Find(object.Parent()));
    if (inSlot)
      return;
    if (object.ParentSlot().Valid())
      m_draft.MoveUnder(id, object.Parent());
    SetAutoAssignedName(*m_draft.Find(id), nullptr);
  }

  static bool AutoAssigned(const SubjectRecord& object) { return Value<bool>(object, Paths::AutoAssignEnabled()); }

  /// Without a name, the entry is left without a value.
  void SetAutoAssignedName(const SubjectRecord& object, const std::string* name)
  {
    const SchemaEntry& entry = *object.schema->Find(Paths::AutoAssignedName());
    const auto* current = std::get_if<std::string>(&object.Get(entry));
    if (name == nullptr ? current != nullptr : current == nullptr || *current != *name)
      m_draft.Change(object.id, NMX::EAspect::Parameters)
          .Set(entry, name != nullptr ? NMX::Value(*name) : NMX::Value{});
  }

  void SetBits(Id id, std::uint64_t mask, std::uint64_t bits)
  {
    if ((m_draft.Find(id)->bits & mask) == bits)
      return;
    SubjectRecord& changed = m_draft.Change(id, NMX::EAspect::Warnings);
    changed.bits = (changed.bits & ~mask) | bits;
  }

  const Bits& m_bits = Bits::Instance();
  Draft& m_draft;
  const bool m_autoAssign;
  std::set<Id> m_characters; // those to be brought up to date
  std::vector<Id> m_objects; // those that may have come out of a slot
};

}

bool IsAutoAssignable(const SubjectRecord& record)
{
  return IsObject(record) && !record.Parent().Valid() && Value<bool>(record, Paths::AutoAssignEnabled());
}

bool AwaitsObjects(const SubjectRecord& record)
{
  const std::uint64_t wanted = Bits::Instance().enabled | Bits::Instance().emptySlot;
  return IsCharacter(&record) && (record.bits & wanted) == wanted;
}

void DeriveCharacters(Draft& draft, bool autoAssign)
{
  Deriver(draft, autoAssign).RunForTouched();
}

void DeriveAllCharacters(Draft& draft, bool autoAssign)
{
  Deriver(draft, autoAssign).RunForAll();
}

}
