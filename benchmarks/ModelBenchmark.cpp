// The panel's models: sorting names against comparing them with a collator, rows that come one by one against Qt's
// standard model, and a refresh against a bare pass over the stamps of all subjects.

#include "StandaloneHost/Store/VStore.h"
#include "StoreInterface/EntryPaths.h"
#include "SubjectStoreUI/RankedRows.h"
#include "SubjectStoreUI/VSortSubjectsProxyModel.h"
#include "SubjectStoreUI/VSubjectListModelStore.h"
#include "SubjectStoreUI/VSubjectModelInternalData.h"

#include <QCollator>
#include <QStandardItemModel>

#include <benchmark/benchmark.h>

#include <algorithm>
#include <malloc.h>
#include <memory>
#include <numeric>
#include <random>
#include <string>
#include <vector>

namespace
{

using namespace SubjectStoreUI;

constexpr int rowCount = 100000;
constexpr int subjectCount = 10000;

/// 0 to `count` - 1 in the same random order each time.
std::vector<int> Shuffled(int count)
{
  std::vector<int> numbers(static_cast<std::size_t>(count));
  std::iota(numbers.begin(), numbers.end(), 0);
  std::shuffle(numbers.begin(), numbers.end(), std::mt19937(7));
  return numbers;
}

/// The store calls nobody: models are refreshed by hand.
class NoPostal : public NMX::IPostalService
{
public:
  void Post(std::function<void()> /*task*/) override {}
};

struct Subjects
{
  explicit Subjects(int count)
  {
    const auto editor = store->Editor();
    for (const int number : Shuffled(count))
    {
      ids.emplace_back();
      (void)editor->Add(NMX::ESubjectKind::BasicObjects,
                        (number % 2 != 0 ? "Subject " : "subject ") + std::to_string(number), ids.back());
    }
    (void)editor->Commit();
    list = NMX::MakeShared<VSubjectListModelStore>(
        std::make_shared<VSubjectModelInternalData>(store, std::make_shared<NoPostal>()));
  }

  std::shared_ptr<Store::VStore> store = NMX::MakeShared<Store::VStore>();
  std::vector<NMX::TSubjectStoreId> ids;
  std::shared_ptr<VSubjectListModelStore> list;
};

void SortNaturally(benchmark::State& state)
{
  const Subjects subjects(rowCount);
  for (auto _ : state)
  {
    const VSortSubjectsProxyModel sorted(subjects.list, VSubjectTypeGadget(), QString(), nullptr);
    if (sorted.index(rowCount - 1, 0).data(SubjectsModelRole::SubjectName) != "Subject 99999")
      state.SkipWithError("not sorted");
  }
}

class CollatedProxy : public QSortFilterProxyModel
{
public:
  explicit CollatedProxy(QAbstractItemModel& source) : m_collator(QLocale(QLocale::English, QLocale::UnitedStates))
  {
    m_collator.setNumericMode(true);
    m_collator.setCaseSensitivity(Qt::CaseInsensitive);
    setDynamicSortFilter(false);
    setSortRole(SubjectsModelRole::SubjectProxySortName);
    setSourceModel(&source);
    sort(0);
  }

protected:
  bool lessThan(const QModelIndex& left, const QModelIndex& right) const override
  {
    return m_collator.compare(left.data(sortRole()).toString(), right.data(sortRole()).toString()) < 0;
  }

private:
  QCollator m_collator;
};

void SortWithCollator(benchmark::State& state)
{
  const Subjects subjects(rowCount);
  for (auto _ : state)
  {
    const CollatedProxy sorted(*subjects.list);
    if (sorted.index(rowCount - 1, 0).data(SubjectsModelRole::SubjectName) != "Subject 99999")
      state.SkipWithError("not sorted");
  }
}

/// Rows as the list of subjects keeps them.
class RankedModel : public QAbstractListModel
{
public:
  [[nodiscard]] int rowCount(const QModelIndex& /*parent*/ = {}) const override { return m_rows.Count(); }
  [[nodiscard]] QVariant data(const QModelIndex& /*index*/, int /*role*/) const override { return {}; }

  void Insert(int position, int id)
  {
    const NMX::TSubjectStoreId subject(static_cast<unsigned>(id) + 1);
    beginInsertRows({}, position, position);
    m_rows.Insert(m_rows.End(), subject);
    endInsertRows();
    benchmark::DoNotOptimize(m_rows.PositionOf(subject));
  }

private:
  struct Row
  {
    explicit Row(NMX::TSubjectStoreId id) : subject(id) {}
    virtual ~Row() = default;
    [[nodiscard]] NMX::TSubjectStoreId Subject() const { return subject; }

    NMX::TSubjectStoreId subject;
    const void* model = nullptr;
  };

  RankedRows<Row> m_rows;
};

class StandardModel : public QStandardItemModel
{
public:
  void Insert(int position, int id)
  {
    auto item = std::make_unique<QStandardItem>();
    item->setData(id, SubjectsModelRole::SubjectStoreId);
    insertRow(position, item.release());
  }
};

/// Where each row of a random order comes to lie among those before it.
std::vector<int> Positions(const std::vector<int>& ids)
{
  // Counts of the ids that are there already, summed in the manner of a binary indexed tree.
  std::vector<int> sums(ids.size() + 1);
  std::vector<int> positions;
  for (const int id : ids)
  {
    int position = 0;
    for (auto i = static_cast<std::size_t>(id); i > 0; i &= i - 1)
      position += sums[i];
    positions.push_back(position);
    for (auto i = static_cast<std::size_t>(id) + 1; i < sums.size(); i += i & -i)
      ++sums[i];
  }
  return positions;
}

std::size_t UsedBytes()
{
  const auto info = mallinfo2();
  return info.uordblks + info.hblkhd;
}

template <class Model>
void InsertRows(benchmark::State& state)
{
  const std::vector<int> ids = Shuffled(rowCount);
  const std::vector<int> positions = Positions(ids);
  double bytes = 0;
  for (auto _ : state)
  {
    const std::size_t before = UsedBytes();
    auto model = std::make_unique<Model>();
    for (std::size_t i = 0; i < ids.size(); ++i)
      model->Insert(positions[i], ids[i]);
    bytes = static_cast<double>(UsedBytes() - before);
    state.PauseTiming();
    model.reset();
    state.ResumeTiming();
  }
  state.counters["bytes per row"] = bytes / rowCount;
}

void RefreshAfterOneChange(benchmark::State& state)
{
  const Subjects subjects(subjectCount);
  int told = 0;
  QObject::connect(subjects.list.get(), &QAbstractItemModel::dataChanged, subjects.list.get(), [&] { ++told; });
  std::mt19937 random(7);
  int changes = 0;
  for (auto _ : state)
  {
    state.PauseTiming();
    {
      const auto editor = subjects.store->Editor();
      (void)editor->SetValue(subjects.ids[random() % subjects.ids.size()], NMX::Paths::EntranceThreshold(),
                             static_cast<std::uint32_t>(++changes));
      (void)editor->Commit();
    }
    state.ResumeTiming();
    subjects.list->refresh();
  }
  if (told != changes)
    state.SkipWithError("not every change was told of");
}

void PassOverStamps(benchmark::State& state)
{
  const Subjects subjects(subjectCount);
  for (auto _ : state)
  {
    const auto reader = subjects.store->Reader();
    std::uint64_t newest = 0;
    for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
    {
      std::vector<NMX::TSubjectStoreId> ids;
      (void)reader->Subjects(kind, ids);
      for (const NMX::TSubjectStoreId id : ids)
      {
        NMX::ChangeStamps stamps{};
        (void)reader->Stamps(id, stamps);
        newest = std::max(newest, stamps[0]);
      }
    }
    benchmark::DoNotOptimize(newest);
  }
}

}

BENCHMARK(SortNaturally)->Unit(benchmark::kMillisecond);
BENCHMARK(SortWithCollator)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(InsertRows, RankedModel)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(InsertRows, StandardModel)->Unit(benchmark::kMillisecond);
BENCHMARK(RefreshAfterOneChange)->Unit(benchmark::kMicrosecond);
BENCHMARK(PassOverStamps)->Unit(benchmark::kMicrosecond);
