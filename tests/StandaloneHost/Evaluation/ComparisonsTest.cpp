#include "StandaloneHost/Evaluation/Comparisons.h"

#include <gmock/gmock.h>

#include <map>
#include <random>
#include <set>

using Evaluation::Comparisons;
using Evaluation::MarkerLayout;
using testing::ElementsAre;
using Id = Comparisons::Id;
using Pair = std::pair<std::uint64_t, std::uint64_t>;

namespace
{

class ComparisonsTest : public testing::Test
{
protected:
  void Put(std::uint64_t id)
  {
    comparisons.Put(Id(id), std::make_shared<MarkerLayout>(std::vector<Eigen::Vector3d>{}, 4));
  }

  /// Carries out what is next; the pairs in `matches` match.
  Pair Step()
  {
    const auto next = comparisons.Next();
    EXPECT_TRUE(next && comparisons.IsNext(*next));
    const Pair pair{next->first.Value(), next->second.Value()};
    const auto match = matches.find(pair);
    comparisons.Finish({match != matches.end(), true, match != matches.end() ? match->second : 0, 7});
    return pair;
  }

  std::multiset<Pair> Drain()
  {
    std::multiset<Pair> pairs;
    while (comparisons.Next())
      pairs.insert(Step());
    return pairs;
  }

  Pair Progress() const { return {comparisons.Progress().done, comparisons.Progress().required}; }

  /// Findings as object, closest (-1: none), final.
  std::vector<std::tuple<std::uint64_t, double, bool>> Findings()
  {
    std::vector<std::tuple<std::uint64_t, double, bool>> findings;
    for (const auto& finding : comparisons.TakeFindings())
      findings.emplace_back(finding.object.Value(), finding.closest.value_or(-1), finding.final);
    return findings;
  }

  Comparisons comparisons;
  std::map<Pair, double> matches;
};

}

TEST_F(ComparisonsTest, ComparesEveryObjectWithItselfAndEveryOtherBothWays)
{
  EXPECT_TRUE(comparisons.Finished());
  EXPECT_EQ(Progress(), Pair(0, 0));
  for (const std::uint64_t id : {3, 1, 2})
    Put(id);
  EXPECT_EQ(Progress(), Pair(0, 9));
  EXPECT_EQ(Drain(), (std::multiset<Pair>{{1, 1}, {1, 2}, {1, 3}, {2, 1}, {2, 2}, {2, 3}, {3, 1}, {3, 2}, {3, 3}}));
  EXPECT_EQ(Progress(), Pair(9, 9));
  EXPECT_TRUE(comparisons.Finished());
  EXPECT_EQ(comparisons.MostSteps(), 7U);
}

TEST_F(ComparisonsTest, AChangeMakesDueWhatItTouchesAndNothingElse)
{
  for (const std::uint64_t id : {1, 2, 3})
    Put(id);
  Drain();
  Put(2);
  EXPECT_EQ(Progress(), Pair(0, 5)) << "counting starts anew after everything was done";
  EXPECT_EQ(Drain(), (std::multiset<Pair>{{1, 2}, {2, 1}, {2, 2}, {2, 3}, {3, 2}}));

  // In the middle of it, what is required grows.
  Put(4);
  Step();
  Step();
  EXPECT_EQ(Progress(), Pair(2, 7));
  const auto running = comparisons.Next();
  Put(3);
  EXPECT_TRUE(comparisons.IsNext(*running)) << "the comparison of others goes on";
  EXPECT_EQ(Progress(), Pair(2, 2 + 7 + 3));
  Put(4);
  EXPECT_FALSE(comparisons.IsNext(*running));
  Drain();
  comparisons.Touch();
  EXPECT_EQ(Progress(), Pair(0, 0)) << "a change that makes nothing due";
}

TEST_F(ComparisonsTest, FindingsAreRaisedAtOnceAndLoweredWhenAllIsDoneOrTheOtherObjectGoes)
{
  matches = {{{2, 1}, 4.0}, {{1, 3}, 2.0}, {{1, 2}, 3.0}};
  for (const std::uint64_t id : {1, 2, 3})
    Put(id);
  for (int i = 0; i < 3; ++i)
    Step();
  EXPECT_THAT(Findings(), ElementsAre(std::tuple(2, 4.0, false)));
  Drain();
  EXPECT_THAT(Findings(), ElementsAre(std::tuple(1, 2.0, true), std::tuple(2, 4.0, true), std::tuple(3, -1.0, true)));
  EXPECT_EQ(comparisons.Distance(Id(1), Id(2)), 3.0);
  EXPECT_EQ(comparisons.Distance(Id(3), Id(1)), std::nullopt);

  // A changed object's matches are not known any more, but what they raised stays until they are known again.
  matches.erase({1, 3});
  Put(3);
  EXPECT_EQ(comparisons.Distance(Id(1), Id(3)), std::nullopt);
  EXPECT_TRUE(Findings().empty());
  Drain();
  EXPECT_THAT(Findings(), ElementsAre(std::tuple(1, 3.0, true), std::tuple(3, -1.0, true)));

  Put(5);
  comparisons.Remove(Id(2));
  EXPECT_THAT(Findings(), ElementsAre(std::tuple(1, -1.0, true), std::tuple(2, -1.0, true)));
  comparisons.Remove(Id(77));
  EXPECT_THAT(Findings(), ElementsAre(std::tuple(77, -1.0, true))) << "one that was never compared";
  Drain();
  Findings();
  comparisons.ReviewAll();
  EXPECT_EQ(Findings().size(), 3U);
}

TEST_F(ComparisonsTest, RestartMakesAllDueAndKeepsWhatIsToBeCleared)
{
  matches = {{{1, 2}, 3.0}};
  Put(1);
  Put(2);
  Drain();
  comparisons.Remove(Id(9));
  comparisons.Restart();
  EXPECT_EQ(comparisons.MostSteps(), 0U);
  EXPECT_EQ(comparisons.Distance(Id(1), Id(2)), std::nullopt);
  EXPECT_EQ(Progress(), Pair(0, 4));
  EXPECT_THAT(Findings(), ElementsAre(std::tuple(9, -1.0, true)));
  EXPECT_EQ(Drain().size(), 4U);
  comparisons.Clear();
  EXPECT_EQ(Progress(), Pair(0, 0));
  EXPECT_TRUE(Findings().empty());
}

TEST_F(ComparisonsTest, UnderRandomChangesEveryPairIsComparedInItsLatestFormAndTheCountsAddUp)
{
  std::mt19937 random(5);
  std::map<std::uint64_t, int> versions;        // of the objects that are in
  std::map<Pair, std::pair<int, int>> compared; // the versions that were compared last
  std::uint64_t done = 0;
  for (int round = 0; round < 4000; ++round)
  {
    const std::uint64_t id = random() % 8 + 1;
    switch (random() % 5)
    {
    case 0:
      if (comparisons.Finished())
        done = 0;
      Put(id);
      ++versions[id];
      break;
    case 1:
      if (comparisons.Finished())
        done = 0;
      comparisons.Remove(Id(id));
      versions.erase(id);
      break;
    default:
      for (auto steps = random() % 20; steps > 0 && comparisons.Next(); --steps)
      {
        const Pair pair = Step();
        compared[pair] = {versions.at(pair.first), versions.at(pair.second)};
        ++done;
      }
    }
    std::uint64_t due = 0;
    for (const auto& [first, firstVersion] : versions)
      for (const auto& [second, secondVersion] : versions)
        due += compared[{first, second}] != std::pair(firstVersion, secondVersion) ? 1 : 0;
    // An object that left and came back counts versions anew: it must not look compared.
    for (auto& [pair, version] : compared)
      if (!versions.contains(pair.first) || !versions.contains(pair.second))
        version = {-1, -1};
    ASSERT_EQ(Progress(), Pair(done, done + due)) << "round " << round;
    ASSERT_EQ(comparisons.Finished(), due == 0);
  }
}
