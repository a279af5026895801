#pragma once

#include "StandaloneHost/Store/Derivation.h"
#include "StandaloneHost/Store/Draft.h"
#include "StandaloneHost/Store/ReaderOperations.h"
#include "StoreInterface/IEntryEditor.h"

#include <mutex>

namespace Store
{

/// Keeps a finished edit and tells whoever subscribed; the editor's way back into the store.
class ICommitter
{
public:
  /// `edit` is the editor's hold of the store, released before anyone is told.
  virtual NMX::IResult Commit(ChangeSet&& changes, std::unique_lock<std::mutex> edit) = 0;

protected:
  ~ICommitter() = default;
};

/// Edit access: collects the changes in a draft. Once committed, or when its thread held a read access as it was opened
/// (waiting for others could then never end), it finds nothing and refuses every edit.
class VEntryEditor final : public ReaderOperations<VEntryEditor, NMX::IEntryEditor>
{
public:
  VEntryEditor(const StoreState& state, const DerivationRules& rules, std::mutex& editMutex, ICommitter& committer);

  NMX::IResult Subjects(NMX::ESubjectKind kind, std::vector<Id>& ids) const override;
  [[nodiscard]] const NMX::Value* FindApplicationEntry(NMX::EntryPath path) const override;
  [[nodiscard]] std::vector<NMX::EntryPath> ApplicationEntries(NMX::EntryPath path) const override;

  NMX::IResult Add(NMX::ESubjectKind kind, std::string_view name, Id& id) override;
  NMX::IResult Remove(Id id) override;
  NMX::IResult Rename(Id id, std::string_view name, NMX::ENotify notify) override;
  NMX::IResult SetValue(Id id, NMX::EntryPath path, NMX::Value value, NMX::ENotify notify) override;
  NMX::IResult SetApplicationEntry(NMX::EntryPath path, NMX::Value value) override;
  NMX::IResult Commit() override;

private:
  friend ReaderOperations;
  const SubjectRecord* Lookup(std::string_view name) const { return Open() ? m_draft.Find(name) : nullptr; }
  const SubjectRecord* Lookup(Id id) const { return Open() ? m_draft.Find(id) : nullptr; }

  [[nodiscard]] bool Open() const { return m_edit.owns_lock(); }
  [[nodiscard]] NMX::IResult CheckName(std::string_view name, Id owner) const;
  [[nodiscard]] NMX::IResult CheckNewEntry(const NMX::EntryPath& path) const;
  NMX::IResult SetParent(Id id, Id parent);

  std::unique_lock<std::mutex> m_edit;
  NMX::IResult m_closed = NMX::EResult::NotAvailable; // the answer to edits when it is not open
  const DerivationRules& m_rules;
  Draft m_draft;
  ICommitter& m_committer;
};

}
