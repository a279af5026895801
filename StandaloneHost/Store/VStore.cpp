#include "StandaloneHost/Store/VStore.h"

#include "HostInterface/DebugServices/CallAssertFailHandler.h"
#include "StandaloneHost/Store/IArchive.h"
#include "StandaloneHost/Store/VStoreReader.h"

#include <algorithm>
#include <utility>

namespace Store
{

using NMX::EResult;
using NMX::IResult;

VStore::VStore(DerivationRules rules) : VStore(nullptr, rules) {}

VStore::VStore(std::unique_ptr<IArchive> archive, DerivationRules rules) : m_rules(rules), m_archive(std::move(archive))
{
  for (auto& callback : m_kindCallbacks)
    callback = NMX::MakeShared<Callback>();
  if (m_archive)
  {
    m_state.Apply(m_archive->Load());
    BringUpToDate();
  }
}

/// Whoever wrote the archive may have had other rules.
void VStore::BringUpToDate()
{
  Draft draft(m_state);
  draft.Begin();
  DeriveAll(draft, m_rules);
  if (!draft.Changes().Empty() && m_archive->Keep(draft.Changes(), m_state).Succeeded())
    m_state.Apply(std::move(draft.Changes()));
}

VStore::~VStore()
{
  if (m_archive)
    m_archive->End(m_state);
}

std::string VStore::Fault() const
{
  return m_archive ? m_archive->Fault() : std::string{};
}

std::unique_ptr<const NMX::IStoreReader> VStore::Reader() const
{
  return std::make_unique<VStoreReader>(m_state, m_stateMutex);
}

std::unique_ptr<NMX::IEntryEditor> VStore::Editor()
{
  ICommitter& committer = *this;
  return std::make_unique<VEntryEditor>(m_state, m_rules, m_editMutex, committer);
}

std::shared_ptr<NMX::IStore::ChangeCallback> VStore::SubjectsChanged(NMX::ESubjectKind kind)
{
  return m_kindCallbacks[static_cast<std::size_t>(kind)];
}

NMX::Subscription VStore::OnChange(std::string pattern, std::weak_ptr<NMX::IPostalService> postal,
                                   std::function<void()> handler)
{
  const bool beneath = pattern.ends_with("/*");
  if (beneath)
    pattern.pop_back();
  auto callback = NMX::MakeShared<Callback>();
  auto subscription = callback->Subscribe(std::move(postal), std::move(handler));
  const std::lock_guard lock(m_patternMutex);
  std::erase_if(m_patterns, [](const PatternSubscription& known) { return known.alive.expired(); });
  m_patterns.push_back({std::move(pattern), beneath, std::move(callback), subscription});
  return subscription;
}

bool VStore::Empty() const
{
  const std::shared_lock lock(m_stateMutex);
  return m_state.SubjectCount() == 0 &&
         std::all_of(m_state.ApplicationEntries().begin(), m_state.ApplicationEntries().end(),
                     [](const auto& entry) { return entry.first.Text().starts_with("Application/Settings/"); });
}

IResult VStore::Commit(ChangeSet&& changes, std::unique_lock<std::mutex> edit)
{
  if (changes.Empty())
    return EResult::Ok;
  if (VStoreReader::HeldByThisThread() != 0)
  {
    // Waiting for one's own read access would never end.
    DebugServices::CallAssertFailHandler("no read access is held by the thread that commits", __FILE__, __LINE__);
    return EResult::Conflict;
  }
  if (m_archive)
    if (const IResult kept = m_archive->Keep(changes, m_state); kept.Failed())
      return kept;

  unsigned kinds = 0;
  for (const auto& [id, change] : changes.subjects)
    kinds |= 1U << static_cast<unsigned>(change.kind);
  std::vector<NMX::EntryPath> paths;
  paths.reserve(changes.applicationEntries.size());
  for (const auto& [path, value] : changes.applicationEntries)
    paths.push_back(path);
  {
    const std::unique_lock state(m_stateMutex);
    m_state.Apply(std::move(changes));
  }
  edit.unlock();
  TellSubjects(kinds);
  TellApplication(paths);
  return EResult::Ok;
}

void VStore::TellSubjects(unsigned kinds)
{
  for (std::size_t kind = 0; kind < m_kindCallbacks.size(); ++kind)
    if ((kinds >> kind & 1U) != 0)
      m_kindCallbacks[kind]->Fire();
}

void VStore::TellApplication(const std::vector<NMX::EntryPath>& paths)
{
  if (paths.empty())
    return;
  std::vector<std::shared_ptr<Callback>> concerned;
  {
    const std::lock_guard lock(m_patternMutex);
    for (const auto& subscription : m_patterns)
      for (const NMX::EntryPath& path : paths)
        if (subscription.beneath ? path.Text().starts_with(subscription.path) : path.Text() == subscription.path)
        {
          concerned.push_back(subscription.callback);
          break;
        }
  }
  for (const auto& callback : concerned)
    callback->Fire();
}

}
