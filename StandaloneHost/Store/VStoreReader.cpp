#include "StandaloneHost/Store/VStoreReader.h"

#include <memory>
#include <new>

namespace Store
{

namespace
{

thread_local int heldByThisThread = 0;

struct FreeMemory
{
  void operator()(void* place) const noexcept { ::operator delete(place); }
};

/// Memory for one reader that is not in use.
thread_local std::unique_ptr<void, FreeMemory> spare;

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

void* VStoreReader::operator new(std::size_t size)
{
  return spare ? spare.release() : ::operator new(size);
}

void VStoreReader::operator delete(void* place, std::size_t /*size*/) noexcept
{
  spare.reset(place);
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
