// Finding one of 100,000 subjects by name and reading one entry, against a bare hash lookup of the same names; and what
// an edit costs in stores of different size.

#include "StandaloneHost/Store/SqliteArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"
#include "tests/Support/TemporaryFolder.h"

#include <benchmark/benchmark.h>
#include <boost/unordered/unordered_flat_map.hpp>

#include <cstdlib>
#include <fstream>
#include <random>
#include <string>
#include <vector>

namespace
{

constexpr int subjectCount = 100000;

std::string Name(int i)
{
  return "Subject " + std::to_string(i);
}

void Fill(NMX::IStore& store, int count)
{
  const auto editor = store.Editor();
  for (int i = 0; i < count; ++i)
  {
    NMX::TSubjectStoreId id;
    (void)editor->Add(NMX::ESubjectKind::BasicObjects, Name(i), id);
  }
  (void)editor->Commit();
}

std::shared_ptr<Store::VStore> MakeStore(int count)
{
  auto store = NMX::MakeShared<Store::VStore>();
  Fill(*store, count);
  return store;
}

/// The same names in the same random order for both, so that both miss the caches alike. Which one comes next depends
/// on the answer to the one before: a caller waits for its answer, and without that the processor would overlap the
/// bare lookups with each other, which no two calls ever are.
const std::vector<std::string>& Questions()
{
  static const std::vector<std::string> questions = []
  {
    std::mt19937 random(7);
    std::vector<std::string> names;
    for (int i = 0; i < 1 << 16; ++i)
      names.push_back(Name(static_cast<int>(random() % subjectCount)));
    return names;
  }();
  return questions;
}

void BareHashLookup(benchmark::State& state)
{
  struct Subject
  {
    bool enabled = true;
  };
  boost::unordered_flat_map<std::string, std::unique_ptr<Subject>> table;
  for (int i = 0; i < subjectCount; ++i)
    table.emplace(Name(i), std::make_unique<Subject>());
  const auto& questions = Questions();
  std::size_t next = 0;
  for (auto _ : state)
  {
    bool enabled = table.find(questions[next % questions.size()])->second->enabled;
    benchmark::DoNotOptimize(enabled);
    next += enabled;
  }
}

void FindByNameAndRead(benchmark::State& state)
{
  const auto store = MakeStore(subjectCount);
  const auto& questions = Questions();
  std::size_t next = 0;
  for (auto _ : state)
  {
    const auto reader = store->Reader();
    NMX::TSubjectStoreId id;
    bool enabled = false;
    (void)reader->FindByName(questions[next % questions.size()], id);
    (void)NMX::Read(*reader, id, NMX::Paths::Enabled(), enabled);
    benchmark::DoNotOptimize(enabled);
    next += enabled;
  }
}

/// Disables and enables one object.
void EditInTurn(benchmark::State& state, NMX::IStore& store)
{
  bool enabled = false;
  for (auto _ : state)
  {
    const auto editor = store.Editor();
    NMX::TSubjectStoreId id;
    (void)editor->FindByName("Subject 50", id);
    (void)editor->SetValue(id, NMX::Paths::Enabled(), enabled);
    if (editor->Commit().Failed())
      state.SkipWithError("the edit was not kept");
    enabled = !enabled;
  }
}

void EditOneEntry(benchmark::State& state)
{
  EditInTurn(state, *MakeStore(static_cast<int>(state.range(0))));
}

/// The same, with each edit in a database.
void EditOneEntryKept(benchmark::State& state)
{
  const TemporaryFolder folder;
  const auto store =
      NMX::MakeShared<Store::VStore>(std::make_unique<Store::SqliteArchive>(folder.Path() / "store.sqlite"));
  Fill(*store, static_cast<int>(state.range(0)));
  EditInTurn(state, *store);
}

/// What it costs to see that the database and its log are still those that were opened.
void LookAtTwoFiles(benchmark::State& state)
{
  const TemporaryFolder folder;
  Store::WatchedFile files[] = {Store::WatchedFile(folder.Path() / "store.sqlite"),
                                Store::WatchedFile(folder.Path() / "store.sqlite-wal")};
  for (auto& file : files)
  {
    std::ofstream(file.Path()) << "content";
    file.Watch();
  }
  for (auto _ : state)
    for (const auto& file : files)
      benchmark::DoNotOptimize(file.State());
}

/// Disables and enables an object of a proximity group of ten, whose warnings depend on each other.
void EditInAGroup(benchmark::State& state)
{
  const auto store = MakeStore(static_cast<int>(state.range(0)));
  {
    const auto editor = store->Editor();
    for (int i = 0; i < static_cast<int>(state.range(0)); ++i)
    {
      NMX::TSubjectStoreId id;
      (void)editor->FindByName(Name(i), id);
      (void)editor->SetValue(id, NMX::Paths::ProximityGroupName(), "Group " + std::to_string(i / 10));
      (void)editor->SetValue(id, NMX::Paths::TemplateGroupName(), std::string(i % 10 == 0 ? "" : "Template"));
    }
    (void)editor->Commit();
  }
  bool enabled = false;
  for (auto _ : state)
  {
    const auto editor = store->Editor();
    NMX::TSubjectStoreId id;
    (void)editor->FindByName("Subject 50", id); // the one that tells the others apart
    (void)editor->SetValue(id, NMX::Paths::Enabled(), enabled);
    (void)editor->Commit();
    enabled = !enabled;
  }
}

/// Gives an object in one of a character's twenty slots a warning, and takes it away, while all other objects wait for
/// a slot to become empty: the character's slots are looked at, and its own warning follows.
void EditInASlot(benchmark::State& state)
{
  const auto store = MakeStore(static_cast<int>(state.range(0)));
  {
    const auto editor = store->Editor();
    for (int i = 0; i < static_cast<int>(state.range(0)); ++i)
    {
      NMX::TSubjectStoreId id;
      (void)editor->FindByName(Name(i), id);
      (void)editor->SetValue(id, NMX::Paths::AutoAssignEnabled(), true);
    }
    std::vector<NMX::Slot> slots;
    for (std::uint64_t slot = 1; slot <= 20; ++slot)
      slots.push_back({NMX::TSubjectStoreId(slot), "Slot " + std::to_string(slot)});
    NMX::TSubjectStoreId character;
    (void)editor->Add(NMX::ESubjectKind::CharactersFromClusters, "Character", character);
    (void)editor->SetValue(character, NMX::Paths::Slots(), std::move(slots));
    (void)editor->Commit();
  }
  bool confused = true;
  for (auto _ : state)
  {
    const auto editor = store->Editor();
    NMX::TSubjectStoreId id;
    (void)editor->FindByName(Name(10), id);
    (void)editor->SetValue(id, NMX::Paths::WarningObjectConfusion(), confused);
    (void)editor->Commit();
    confused = !confused;
  }
}

/// What an archive holds: ten objects for each character.
Store::ChangeSet ArchiveContent(int count)
{
  Store::ChangeSet content;
  for (int i = 1; i <= count; ++i)
  {
    const NMX::TSubjectStoreId id(i);
    const auto kind = i % 11 == 0 ? NMX::ESubjectKind::CharactersFromClusters : NMX::ESubjectKind::BasicObjects;
    auto record = std::make_unique<Store::SubjectRecord>(id, kind, Name(i));
    if (kind == NMX::ESubjectKind::CharactersFromClusters) // what would be derived, so that there is nothing to keep
      record->bits |= Store::KindSchema::CharacterBit(NMX::Paths::WarningNotCalibrated()) |
                      Store::KindSchema::CharacterBit(NMX::Paths::WarningCFCNoReferenceClusterAssigned());
    content.subjects.emplace(id, Store::ChangedSubject{std::move(record), kind});
  }
  content.nextId = NMX::TSubjectStoreId(count + 1);
  return content;
}

void TakeOver(benchmark::State& state)
{
  for (auto _ : state)
  {
    Store::StoreState content;
    content.Apply(ArchiveContent(static_cast<int>(state.range(0))));
    benchmark::DoNotOptimize(content);
  }
}

/// The same, and everything is derived afresh.
void OpenStore(benchmark::State& state)
{
  struct Archive : Store::IArchive
  {
    explicit Archive(int subjects) : count(subjects) {}
    Store::ChangeSet Load() override { return ArchiveContent(count); }
    NMX::IResult Keep(const Store::ChangeSet&, const Store::StoreState&) override { std::abort(); }
    int count;
  };
  for (auto _ : state)
    benchmark::DoNotOptimize(
        NMX::MakeShared<Store::VStore>(std::make_unique<Archive>(static_cast<int>(state.range(0)))));
}

}

BENCHMARK(BareHashLookup);
BENCHMARK(FindByNameAndRead);
BENCHMARK(EditOneEntry)->Arg(100)->Arg(100000);
BENCHMARK(EditOneEntryKept)->Arg(100);
BENCHMARK(LookAtTwoFiles);
BENCHMARK(EditInAGroup)->Arg(100)->Arg(100000);
BENCHMARK(EditInASlot)->Arg(100)->Arg(100000);
BENCHMARK(TakeOver)->Arg(10000)->Unit(benchmark::kMillisecond);
BENCHMARK(OpenStore)->Arg(10000)->Unit(benchmark::kMillisecond);
