#pragma once

#include "StandaloneHost/Store/ReaderOperations.h"
#include "StandaloneHost/Store/StoreState.h"

#include <shared_mutex>

namespace Store
{

/// The paths beneath `path` among application entries, in the order of their texts.
[[nodiscard]] std::vector<NMX::EntryPath> EntriesBeneath(const std::map<NMX::EntryPath, NMX::Value>& entries,
                                                         NMX::EntryPath path);

/// Read access to the committed state: holds it still while it lives.
class VStoreReader final : public ReaderOperations<VStoreReader, NMX::IStoreReader>
{
public:
  VStoreReader(const StoreState& state, std::shared_mutex& mutex);
  ~VStoreReader() override;

  NMX::IResult Subjects(NMX::ESubjectKind kind, std::vector<Id>& ids) const override;
  [[nodiscard]] const NMX::Value* FindApplicationEntry(NMX::EntryPath path) const override;
  [[nodiscard]] std::vector<NMX::EntryPath> ApplicationEntries(NMX::EntryPath path) const override;

  // Opening read access is as frequent as calls are: the memory of the last one is kept for the next.
  static void* operator new(std::size_t size);
  static void operator delete(void* place, std::size_t size) noexcept;

  /// How many read accesses the calling thread holds.
  [[nodiscard]] static int HeldByThisThread();

private:
  friend ReaderOperations;
  const SubjectRecord* Lookup(std::string_view name) const { return m_state.Find(name); }
  const SubjectRecord* Lookup(Id id) const { return m_state.Find(id); }

  const StoreState& m_state;
  std::shared_lock<std::shared_mutex> m_lock;
};

}
