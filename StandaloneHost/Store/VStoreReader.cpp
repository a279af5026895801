#include "StandaloneHost/Store/VStoreReader.h"

namespace Store
{

namespace
{

thread_local int heldByThisThread = 0;

}

std::vector<NMX::EntryPath> EntriesBeneath(const std::map<NMX::EntryPath, NMX::Value>& entries, NMX::EntryPath path)
{
  const std::string prefix = std::string(path.Text()) + '/';
  std::vector<NMX::EntryPath> found;
  for (const auto& [entry, value] : entries)
    if (entry.Text().starts_with(prefix))
      found.push_back(entry);
  std::sort(found.begin(), found.end(), [](auto left, auto right) { return left.Text() < right.Text(); });
  return found;
}

VStoreReader::VStoreReader(const StoreState& state, std::shared_mutex& mutex) : m_state(state), m_lock(mutex)
{
  ++heldByThisThread;
}

VStoreReader::~VStoreReader()
{
  --heldByThisThread;
}

int VStoreReader::HeldByThisThread()
{
  return heldByThisThread;
}

NMX::IResult VStoreReader::Subjects(NMX::ESubjectKind kind, std::vector<Id>& ids) const
{
  const auto& subjects = m_state.Subjects(kind);
  ids.assign(subjects.begin(), subjects.end());
  return NMX::EResult::Ok;
}

const NMX::Value* VStoreReader::FindApplicationEntry(NMX::EntryPath path) const
{
  const auto found = m_state.ApplicationEntries().find(path);
  return found != m_state.ApplicationEntries().end() ? &found->second : nullptr;
}

std::vector<NMX::EntryPath> VStoreReader::ApplicationEntries(NMX::EntryPath path) const
{
  return EntriesBeneath(m_state.ApplicationEntries(), path);
}

}
