#include "StandaloneHost/Store/VEntryEditor.h"

#include "HostInterface/DebugServices/CallAssertFailHandler.h"
#include "StandaloneHost/Store/NameRule.h"
#include "StandaloneHost/Store/VStoreReader.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/ValueLimits.h"

#include <utility>

namespace Store
{

using NMX::EResult;
using NMX::IResult;

VEntryEditor::VEntryEditor(const StoreState& state, const DerivationRules& rules, std::mutex& editMutex,
                           ICommitter& committer)
    : m_edit(editMutex, std::defer_lock), m_rules(rules), m_draft(state), m_committer(committer)
{
  if (VStoreReader::HeldByThisThread() == 0)
  {
    m_edit.lock();
    m_draft.Begin();
    return;
  }
  DebugServices::CallAssertFailHandler("no read access is held by the thread that edits", __FILE__, __LINE__);
  m_closed = EResult::Conflict;
}

IResult VEntryEditor::Subjects(NMX::ESubjectKind kind, std::vector<Id>& ids) const
{
  if (!Open())
    return m_closed;
  ids = m_draft.Subjects(kind);
  return EResult::Ok;
}

const NMX::Value* VEntryEditor::FindApplicationEntry(NMX::EntryPath path) const
{
  return Open() ? m_draft.FindApplicationEntry(path) : nullptr;
}

std::vector<NMX::EntryPath> VEntryEditor::ApplicationEntries(NMX::EntryPath path) const
{
  return Open() ? m_draft.ApplicationEntries(path) : std::vector<NMX::EntryPath>{};
}

IResult VEntryEditor::CheckName(std::string_view name, Id owner) const
{
  if (!NameRule::Allows(name, NamePattern()))
    return EResult::InvalidName;
  const SubjectRecord* holder = m_draft.Find(name);
  return holder == nullptr || holder->id == owner ? EResult::Ok : EResult::AlreadyPresent;
}

IResult VEntryEditor::Add(NMX::ESubjectKind kind, std::string_view name, Id& id)
{
  if (!Open())
    return m_closed;
  if (const IResult checked = CheckName(name, Id{}); checked.Failed())
    return checked;
  ForgetLatest();
  id = m_draft.Add(kind, std::string(name));
  return EResult::Ok;
}

IResult VEntryEditor::Remove(Id id)
{
  if (!Open())
    return m_closed;
  const SubjectRecord* record = Record(id);
  if (record == nullptr)
    return EResult::InvalidId;
  const auto children = record->Children();
  const Id parent = record->Parent();
  ForgetLatest();
  for (const Id child : children)
    m_draft.MoveUnder(child, Id{});
  if (parent.Valid())
    m_draft.MoveUnder(id, Id{});
  m_draft.Remove(id);
  return EResult::Ok;
}

IResult VEntryEditor::Rename(Id id, std::string_view name, NMX::ENotify /*notify*/)
{
  if (!Open())
    return m_closed;
  const SubjectRecord* record = Record(id);
  if (record == nullptr)
    return EResult::InvalidId;
  if (record->Name() == name)
    return EResult::Ok;
  if (const IResult checked = CheckName(name, id); checked.Failed())
    return checked;
  ForgetLatest();
  m_draft.Rename(id, std::string(name));
  return EResult::Ok;
}

IResult VEntryEditor::SetValue(Id id, NMX::EntryPath path, NMX::Value value, NMX::ENotify /*notify*/)
{
  if (!Open())
    return m_closed;
  const SubjectRecord* record = Record(id);
  if (record == nullptr)
    return EResult::InvalidId;
  const SchemaEntry* entry = record->schema->Find(path);
  if (entry == nullptr)
    return EResult::NotFound;
  if (entry->writer == EWriter::StoreOnly)
    return EResult::NotPermitted;
  const bool empties = std::holds_alternative<std::monostate>(value);
  if (empties ? entry->storage == EStorage::Bit : TypeOf(value) != entry->type)
    return EResult::InvalidType;
  if (path == NMX::Paths::Flags() || path == NMX::Paths::ParentSubjectId() || path == NMX::Paths::ParentSubjectSlotId())
  {
    if (empties)
      return EResult::InvalidType;
  }
  if (path == NMX::Paths::Flags() &&
      ((std::get<std::uint32_t>(value) ^ NMX::KindFlags(record->kind)) & NMX::SubjectFlag::objectKindMask) != 0)
    return EResult::InvalidValue;
  if (record->Get(*entry) == value)
    return EResult::Ok;
  if (!NMX::ValueLimits::Admits(value, record->Get(*entry)))
    return EResult::InvalidValue;

  ForgetLatest();
  if (path == NMX::Paths::ParentSubjectId())
    return SetParent(id, std::get<Id>(value));
  m_draft.Change(id, entry->aspect).Set(*entry, std::move(value));
  return EResult::Ok;
}

IResult VEntryEditor::SetParent(Id id, Id parent)
{
  if (parent.Valid() && m_draft.Find(parent) == nullptr)
    return EResult::InvalidId;
  for (Id ancestor = parent; ancestor.Valid(); ancestor = m_draft.Find(ancestor)->Parent())
    if (ancestor == id)
      return EResult::InvalidValue;
  m_draft.MoveUnder(id, parent);
  return EResult::Ok;
}

IResult VEntryEditor::SetApplicationEntry(NMX::EntryPath path, NMX::Value value)
{
  if (!Open())
    return m_closed;
  const NMX::Value* known = m_draft.FindApplicationEntry(path);
  if (known != nullptr ? *known == value : std::holds_alternative<std::monostate>(value))
    return EResult::Ok;
  if (!NMX::ValueLimits::Admits(value, known != nullptr ? *known : NMX::Value{}))
    return EResult::InvalidValue;
  if (known == nullptr)
    if (const IResult checked = CheckNewEntry(path); checked.Failed())
      return checked;
  m_draft.SetApplicationEntry(path, std::move(value));
  return EResult::Ok;
}

IResult VEntryEditor::CheckNewEntry(const NMX::EntryPath& path) const
{
  if (!NMX::ValueLimits::TextProblem(path.Text(), NMX::ValueLimits::pathBytes).empty())
    return EResult::InvalidValue;
  return m_draft.ApplicationEntryCount() < NMX::ValueLimits::entries ? EResult::Ok : EResult::AllocationFailure;
}

IResult VEntryEditor::Commit()
{
  if (!Open())
    return m_closed;
  DeriveDependents(m_draft, m_rules);
  ForgetLatest();
  return m_committer.Commit(std::move(m_draft.Changes()), std::move(m_edit));
}

}
