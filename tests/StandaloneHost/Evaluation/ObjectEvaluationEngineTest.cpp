#include "StandaloneHost/Evaluation/VObjectEvaluationEngine.h"

#include "StandaloneHost/Evaluation/ConfusionWarnings.h"
#include "StandaloneHost/Evaluation/EvaluationSettings.h"
#include "tests/Support/Eventually.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

#include <atomic>
#include <chrono>
#include <limits>
#include <map>
#include <random>
#include <thread>

using namespace std::chrono_literals;
using Evaluation::VObjectEvaluationEngine;
using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using Id = NMX::TSubjectStoreId;
namespace Paths = NMX::Paths;

namespace
{

using Positions = std::vector<NMX::Position>;

/// Different for each number, and without symmetry.
Positions Shape(unsigned number, std::size_t count = 6)
{
  std::mt19937 random(number);
  std::uniform_real_distribution<double> place(-150, 150);
  Positions markers(count);
  for (auto& marker : markers)
    marker = {place(random), place(random), place(random)};
  return markers;
}

/// So many markers so close together that a comparison of two such objects has no end, if many of them are needed.
Positions Crowd(unsigned number)
{
  Positions markers = Shape(number, 60);
  for (auto& marker : markers)
    marker = {marker.x / 5, marker.y / 5, marker.z / 5};
  return markers;
}

constexpr std::uint32_t manyMarkers = 40;

class ObjectEvaluationEngineTest : public StoreFixture
{
protected:
  ~ObjectEvaluationEngineTest() override { engine->Stop(); }

  Id Add(const char* name, Positions markers, ESubjectKind kind = ESubjectKind::BasicObjects)
  {
    Id id;
    Change(
        [&](NMX::IEntryEditor& editor)
        {
          EXPECT_TRUE(editor.Add(kind, name, id).Succeeded());
          const auto path = kind == ESubjectKind::BasicObjects ? Paths::Markers() : Paths::AdditionalMarkerPositions();
          EXPECT_TRUE(editor.SetValue(id, path, std::move(markers)).Succeeded());
        });
    return id;
  }

  IResult Set(Id id, NMX::EntryPath path, NMX::Value value)
  {
    const auto editor = store->Editor();
    EXPECT_TRUE(editor->SetValue(id, path, std::move(value)).Succeeded());
    return editor->Commit();
  }

  /// "-", "possible", "likely", or what should never be.
  std::string Warning(Id id) const
  {
    const auto reader = store->Reader();
    bool possible = false;
    bool likely = false;
    if (NMX::Read(*reader, id, Paths::WarningObjectConfusion(), possible).Failed() ||
        NMX::Read(*reader, id, Paths::WarningObjectConfusionCritical(), likely).Failed())
      return "gone";
    return possible && likely ? "both" : possible ? "possible" : likely ? "likely" : "-";
  }

  std::pair<std::uint64_t, std::uint64_t> Progress() const
  {
    std::uint64_t done = 0;
    std::uint64_t required = 0;
    EXPECT_TRUE(engine->Progress(done, required).Succeeded());
    return {done, required};
  }

  bool EventuallyWarns(Id id, const char* warning) const
  {
    return Eventually([&] { return Warning(id) == warning; });
  }

  double Distance(Id first, Id second) const
  {
    bool matches = false;
    double distance = -1;
    EXPECT_TRUE(engine->MatchDistance(*store->Reader(), first, second, matches, distance).Succeeded());
    EXPECT_EQ(matches, distance != std::numeric_limits<double>::max());
    return distance;
  }

  std::shared_ptr<VObjectEvaluationEngine> engine = NMX::MakeShared<VObjectEvaluationEngine>(store);
};

constexpr double none = std::numeric_limits<double>::max();

}

TEST_F(ObjectEvaluationEngineTest, WarningsFollowMarkersStatesAndRemovals)
{
  const Id crate = Add("Crate", Shape(1));
  const Id glove = Add("Glove", Shape(1), ESubjectKind::SmartObjects);
  const Id sword = Add("Sword", Shape(2));
  EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  EXPECT_TRUE(EventuallyWarns(crate, "likely"));
  EXPECT_TRUE(EventuallyWarns(glove, "likely"));
  EXPECT_TRUE(Eventually([&] { return Progress() == std::pair(9UL, 9UL); }));
  EXPECT_EQ(Warning(sword), "-");
  EXPECT_LT(Distance(crate, glove), 1e-6);
  EXPECT_EQ(Distance(crate, sword), none);

  // Whoever reads has read nothing stale: a change is not mistaken for what was compared before it.
  EXPECT_TRUE(Set(sword, Paths::Markers(), Shape(1)).Succeeded());
  EXPECT_NE(Progress(), std::pair(9UL, 9UL));
  EXPECT_TRUE(EventuallyWarns(sword, "likely"));
  EXPECT_TRUE(Set(crate, Paths::Markers(), Shape(3)).Succeeded());
  EXPECT_EQ(Distance(crate, glove), none);
  EXPECT_TRUE(EventuallyWarns(crate, "-"));
  EXPECT_EQ(Warning(glove), "likely") << "there is the sword";

  EXPECT_TRUE(Set(glove, Paths::Enabled(), false).Succeeded());
  EXPECT_TRUE(EventuallyWarns(glove, "-"));
  EXPECT_TRUE(EventuallyWarns(sword, "-"));
  EXPECT_TRUE(Set(glove, Paths::Enabled(), true).Succeeded());
  EXPECT_TRUE(EventuallyWarns(sword, "likely"));
  Remove(glove);
  EXPECT_TRUE(EventuallyWarns(sword, "-"));

  // The threshold decides how many markers have to be alike.
  Positions half = Shape(3);
  half.resize(4);
  const Id part = Add("Part", std::move(half));
  EXPECT_TRUE(EventuallyWarns(part, "likely"));
  EXPECT_EQ(Warning(crate), "-");
  EXPECT_TRUE(Set(crate, Paths::EntranceThreshold(), 4U).Succeeded());
  EXPECT_TRUE(EventuallyWarns(crate, "likely"));
}

TEST_F(ObjectEvaluationEngineTest, SettingsThatMakeNoSenseAreRefusedAndThoseThatDoLast)
{
  constexpr double infinity = std::numeric_limits<double>::infinity();
  for (const double threshold : {-0.001, infinity, -infinity, std::numeric_limits<double>::quiet_NaN()})
    EXPECT_EQ(engine->SetWarningThreshold(threshold), IResult(EResult::InvalidValue)) << threshold;
  EXPECT_EQ(engine->SetMaximumEvaluationStepCount(0), IResult(EResult::InvalidValue));
  bool enabled = true;
  double threshold = 0;
  std::uint64_t count = 0;
  EXPECT_TRUE(engine->Enabled(enabled).Succeeded());
  EXPECT_TRUE(engine->WarningThreshold(threshold).Succeeded());
  EXPECT_TRUE(engine->MaximumEvaluationStepCount(count).Succeeded());
  EXPECT_FALSE(enabled);
  EXPECT_EQ(threshold, 5.0);
  EXPECT_EQ(count, 10'000U);
  EXPECT_TRUE(store->Empty());

  // What somebody else has put there counts as long as it could have been set.
  EXPECT_TRUE(engine->SetWarningThreshold(0).Succeeded());
  EXPECT_TRUE(engine->SetMaximumEvaluationStepCount(~0ULL).Succeeded());
  {
    const auto editor = store->Editor();
    EXPECT_TRUE(editor->SetApplicationEntry(Evaluation::SettingPaths::WarningThreshold(), infinity).Succeeded());
    EXPECT_TRUE(editor->SetApplicationEntry(Evaluation::SettingPaths::Enabled(), std::string("yes")).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
  }
  EXPECT_TRUE(engine->WarningThreshold(threshold).Succeeded());
  EXPECT_TRUE(engine->MaximumEvaluationStepCount(count).Succeeded());
  EXPECT_TRUE(engine->Enabled(enabled).Succeeded());
  EXPECT_EQ(threshold, 5.0);
  EXPECT_EQ(count, ~0ULL);
  EXPECT_FALSE(enabled);
}

TEST_F(ObjectEvaluationEngineTest, SwitchingItOffClearsWarningsInTheSameEditAndOnAgainBringsThemBack)
{
  const Id one = Add("One", Shape(1));
  const Id other = Add("Other", Shape(1));
  const Id stale = Add("Stale", Shape(2));
  EXPECT_TRUE(Set(stale, Paths::WarningObjectConfusion(), true).Succeeded());
  EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  EXPECT_TRUE(EventuallyWarns(stale, "-")) << "what nothing justifies";
  for (int round = 0; round < 30; ++round)
  {
    EXPECT_TRUE(EventuallyWarns(one, "likely"));
    EXPECT_TRUE(engine->SetEnabled(false).Succeeded());
    EXPECT_EQ(Warning(one) + Warning(other), "--");
    EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  }
  EXPECT_TRUE(EventuallyWarns(other, "likely"));
}

TEST_F(ObjectEvaluationEngineTest, FindingsThatAreNotFinalOnlyRaiseWarningsAndNothingIsWrittenWhileItIsOff)
{
  const Id crate = Add("Crate", Shape(1));
  const auto write = [&](std::optional<double> closest, bool final)
  {
    bool changed = false;
    EXPECT_TRUE(Evaluation::WriteWarnings(*store, {{crate, closest, final}, {Id(99), 0.0, true}}, changed).Succeeded());
    return Warning(crate) + (changed ? " changed" : "");
  };
  EXPECT_EQ(write(0.0, true), "-");
  engine->Stop();
  EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  EXPECT_EQ(write(4.0, false), "possible changed");
  EXPECT_EQ(write(std::nullopt, false), "possible");
  EXPECT_EQ(write(1.0, false), "likely changed");
  EXPECT_EQ(write(4.0, false), "likely");
  EXPECT_EQ(write(4.0, true), "possible changed");
  EXPECT_EQ(write(std::nullopt, true), "- changed");
}

TEST_F(ObjectEvaluationEngineTest, NothingWaitsForALongComparison)
{
  const Id one = Add("One", Crowd(1));
  const Id other = Add("Other", Crowd(2));
  for (const Id id : {one, other})
    EXPECT_TRUE(Set(id, Paths::EntranceThreshold(), manyMarkers).Succeeded());
  EXPECT_TRUE(engine->SetMaximumEvaluationStepCount(~0ULL).Succeeded());
  EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  ASSERT_TRUE(Eventually([&] { return Progress() == std::pair(0UL, 4UL); }));

  // Another object is known of, though its turn does not come; a change of this one gives the comparison up.
  const Id crate = Add("Crate", Shape(1));
  EXPECT_TRUE(Eventually([&] { return Progress() == std::pair(0UL, 9UL); }));
  EXPECT_TRUE(Set(one, Paths::Enabled(), false).Succeeded());
  EXPECT_TRUE(Set(other, Paths::Enabled(), false).Succeeded());
  EXPECT_TRUE(Eventually([&] { return Progress() == std::pair(1UL, 1UL); }));
  EXPECT_TRUE(Set(crate, Paths::EntranceThreshold(), manyMarkers).Succeeded());
  EXPECT_TRUE(Set(crate, Paths::Markers(), Crowd(3)).Succeeded());
  EXPECT_TRUE(Eventually([&] { return Progress() == std::pair(0UL, 1UL); }));

  std::uint64_t done = 0;
  EXPECT_TRUE(engine->SetEnabled(false).Succeeded());
  EXPECT_EQ(engine->Progress(done, done), IResult(EResult::NotAvailable));
  EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  EXPECT_TRUE(Eventually([&] { return Progress() == std::pair(0UL, 1UL); }));
  const auto start = std::chrono::steady_clock::now();
  engine->Stop();
  EXPECT_LT(std::chrono::steady_clock::now() - start, 5s);
}

TEST_F(ObjectEvaluationEngineTest, KeepsTryingToWriteWarningsThatCannotBeKept)
{
  const LogCapture log;
  const Id one = Add("One", Shape(1));
  const Id other = Add("Other", Shape(1));
  EXPECT_TRUE(Set(other, Paths::Enabled(), false).Succeeded());
  EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  EXPECT_TRUE(Eventually([&] { return Progress() == std::pair(1UL, 1UL); }));
  EXPECT_TRUE(Set(other, Paths::Enabled(), true).Succeeded());
  archive.full = true;
  EXPECT_EQ(engine->SetEnabled(false), IResult(EResult::DiskFull));
  EXPECT_EQ(engine->SetWarningThreshold(7), IResult(EResult::DiskFull));
  std::this_thread::sleep_for(100ms);
  archive.full = false;
  EXPECT_TRUE(EventuallyWarns(one, "likely"));
  EXPECT_TRUE(EventuallyWarns(other, "likely"));
}

TEST_F(ObjectEvaluationEngineTest, UnderEditsFromManyThreadsItComesToWhatAFreshEngineFinds)
{
  std::vector<Id> ids;
  for (int i = 0; i < 12; ++i)
    ids.push_back(Add(("Object " + std::to_string(i)).c_str(), Shape(static_cast<unsigned>(i % 5)),
                      i % 3 == 0 ? ESubjectKind::SmartObjects : ESubjectKind::BasicObjects));
  std::atomic<int> told = 0;
  const auto subscription = engine->OnChange([&] { ++told; });
  EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  {
    std::vector<std::jthread> editors;
    for (unsigned seed = 0; seed < 3; ++seed)
      editors.emplace_back(
          [&, seed]
          {
            std::mt19937 random(seed);
            for (int round = 0; round < 150; ++round)
            {
              const std::size_t i = random() % ids.size();
              const auto path = i % 3 == 0 ? Paths::AdditionalMarkerPositions() : Paths::Markers();
              switch (random() % 6)
              {
              case 0:
                EXPECT_TRUE(Set(ids[i], Paths::Enabled(), random() % 3 != 0).Succeeded());
                break;
              case 1:
                EXPECT_TRUE(Set(ids[i], Paths::WarningObjectConfusion(), random() % 2 == 0).Succeeded());
                break;
              case 2:
                EXPECT_TRUE(
                    Set(ids[i], Paths::EntranceThreshold(), static_cast<std::uint32_t>(random() % 7)).Succeeded());
                break;
              case 3:
                EXPECT_TRUE(engine->SetWarningThreshold(static_cast<double>(random() % 10)).Succeeded());
                break;
              default:
                EXPECT_TRUE(Set(ids[i], path, Shape(static_cast<unsigned>(random() % 5))).Succeeded());
              }
              bool matches = false;
              double distance = 0;
              const auto reader = store->Reader();
              (void)engine->MatchDistance(*reader, ids[i], ids[random() % ids.size()], matches, distance);
              std::this_thread::sleep_for(std::chrono::microseconds(random() % 800));
            }
          });
  }
  EXPECT_TRUE(engine->SetWarningThreshold(5).Succeeded());
  EXPECT_TRUE(Set(ids[1], Paths::Markers(), Shape(77)).Succeeded()); // there is something to do for certain
  const auto finished = [&]
  {
    const auto [done, required] = Progress();
    return required > 0 && done == required;
  };
  EXPECT_TRUE(Eventually(finished));
  const auto warnings = [&]
  {
    std::map<Id, std::string> all;
    for (const Id id : ids)
      all[id] = Warning(id);
    return all;
  };
  const auto kept = warnings();
  EXPECT_GT(told, 3);

  EXPECT_TRUE(engine->SetEnabled(false).Succeeded());
  engine->Stop();
  engine = NMX::MakeShared<VObjectEvaluationEngine>(store);
  EXPECT_TRUE(engine->SetEnabled(true).Succeeded());
  EXPECT_TRUE(Eventually(finished));
  EXPECT_EQ(kept, warnings());
}
