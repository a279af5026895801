#include "StandaloneHost/Evaluation/MatchSearch.h"

#include <Eigen/Geometry>
#include <gmock/gmock.h>

#include <algorithm>
#include <limits>
#include <numbers>
#include <numeric>
#include <random>

using Eigen::Vector3d;
using Evaluation::MarkerLayout;
using Evaluation::Match;
using Evaluation::MatchSearch;

namespace
{

using Markers = std::vector<Vector3d>;

constexpr Evaluation::SearchLimits unlimited{10.0, std::numeric_limits<std::uint64_t>::max()};

/// Six markers without any symmetry, far from being flat.
const Markers irregular{{0, 0, 0}, {120, 0, 10}, {0, 80, 35}, {60, 150, 5}, {-70, 40, 60}, {15, -55, 110}};

Markers Moved(Markers markers)
{
  const Eigen::Isometry3d motion =
      Eigen::Translation3d(500, -1200, 80) * Eigen::AngleAxisd(2.1, Vector3d(1, -2, 0.5).normalized());
  for (auto& marker : markers)
    marker = motion * marker;
  std::rotate(markers.begin(), markers.begin() + static_cast<std::ptrdiff_t>(markers.size() / 2), markers.end());
  return markers;
}

Markers Mirrored(Markers markers)
{
  for (auto& marker : markers)
    marker.x() = -marker.x();
  return markers;
}

Markers Polygon(int corners, double radius)
{
  Markers markers;
  for (int i = 0; i < corners; ++i)
  {
    const double angle = 2 * std::numbers::pi * i / corners;
    markers.emplace_back(radius * std::cos(angle), radius * std::sin(angle), 0);
  }
  return markers;
}

MarkerLayout Layout(const Markers& markers, std::size_t threshold = 0)
{
  return {markers, threshold != 0 ? threshold : MarkerLayout::DefaultEntranceThreshold(markers.size())};
}

Match Compare(const MarkerLayout& first, const MarkerLayout& second)
{
  return MatchSearch().Run(first, second, unlimited);
}

Match CompareViews(const MarkerLayout& layout)
{
  return MatchSearch().RunOnItself(layout, unlimited);
}

}

TEST(MatchSearch, IdenticalLayoutsMatchWithoutAnyDistanceHoweverTheyStand)
{
  const Match match = Compare(Layout(irregular, 6), Layout(Moved(irregular)));
  EXPECT_TRUE(match.found);
  EXPECT_TRUE(match.complete);
  EXPECT_NEAR(match.distance, 0, 1e-9);
  EXPECT_GE(match.steps, 6U);
}

TEST(MatchSearch, AMovedMarkerCountsOnlyIfTheThresholdNeedsIt)
{
  Markers other = irregular;
  other[3] += Vector3d(0, 0, 9);
  EXPECT_NEAR(Compare(Layout(irregular, 5), Layout(Moved(other))).distance, 0, 1e-9);

  // Four corners of a square, one lifted by d: the best plane tilts so that each corner is off by d/4.
  const Markers square{{0, 0, 0}, {200, 0, 0}, {200, 200, 0}, {0, 200, 0}};
  Markers lifted = square;
  lifted[0].z() += 8;
  const Match match = Compare(Layout(square, 4), Layout(Moved(lifted)));
  EXPECT_TRUE(match.found);
  EXPECT_NEAR(match.distance, 2, 0.02);

  // No marker may end up further from its counterpart than the reach.
  lifted[0].z() = 50;
  EXPECT_FALSE(Compare(Layout(square, 4), Layout(Moved(lifted))).found);
}

TEST(MatchSearch, AMirroredLayoutIsNoMatchUnlessItIsFlat)
{
  EXPECT_FALSE(Compare(Layout(irregular), Layout(Mirrored(irregular))).found);
  Markers flat = irregular;
  for (auto& marker : flat)
    marker.z() = 0;
  EXPECT_NEAR(Compare(Layout(flat), Layout(Mirrored(flat))).distance, 0, 1e-9);
}

TEST(MatchSearch, TheEntranceThresholdOfTheFirstDecidesSoThatOrderMatters)
{
  Markers larger = irregular;
  larger.insert(larger.end(), {{300, 0, 0}, {310, 90, -40}, {-200, 0, 7}});
  EXPECT_TRUE(Compare(Layout(irregular), Layout(larger)).found);
  EXPECT_FALSE(Compare(Layout(larger), Layout(irregular)).found) << "eight of nine markers cannot be found among six";
  EXPECT_TRUE(Compare(Layout(larger, 5), Layout(irregular)).found);
}

TEST(MatchSearch, SymmetricObjectsAreConfusedWithTheirOwnOtherViewsAndOthersAreNot)
{
  EXPECT_FALSE(CompareViews(Layout(irregular)).found);
  for (const int corners : {4, 5, 6, 11})
    EXPECT_NEAR(CompareViews(Layout(Polygon(corners, 150))).distance, 0, 1e-9) << corners;
  // Half a turn around a line that two of its markers are on.
  EXPECT_NEAR(CompareViews(Layout({{0, 0, 90}, {0, 0, -40}, {60, 0, 0}, {-60, 0, 0}}, 4)).distance, 0, 1e-9);
  // Two markers that are close to each other could change places, but that is no other view.
  EXPECT_FALSE(CompareViews(Layout({{0, 0, 0}, {12, 0, 0}, {0, 230, 0}, {40, 60, 120}, {-70, -20, 33}})).found);
}

TEST(MatchSearch, CoincidentAndCollinearMarkersAreOrdinary)
{
  Markers doubled = irregular;
  doubled.push_back(irregular[2]);
  EXPECT_NEAR(Compare(Layout(doubled, 7), Layout(Moved(doubled))).distance, 0, 1e-9);
  EXPECT_FALSE(Compare(Layout(doubled, 7), Layout(irregular)).found) << "two markers cannot have one counterpart";
  EXPECT_FALSE(CompareViews(Layout(doubled)).found) << "markers in one place that change places";

  const Markers line{{0, 0, 0}, {0, 0, 50}, {0, 0, 130}, {0, 0, 300}, {0, 0, 410}};
  EXPECT_NEAR(Compare(Layout(line, 5), Layout(Moved(line))).distance, 0, 1e-9);
  EXPECT_FALSE(CompareViews(Layout(line)).found) << "a turn about the line itself";
  EXPECT_NEAR(CompareViews(Layout({{0, 0, 0}, {0, 0, 50}, {0, 0, 150}, {0, 0, 200}})).distance, 0, 1e-9)
      << "upside down it looks the same";

  const Markers onePlace(5, Vector3d(7, 7, 7));
  EXPECT_NEAR(Compare(Layout(onePlace), Layout(onePlace)).distance, 0, 1e-9);
  EXPECT_FALSE(CompareViews(Layout(onePlace)).found);
}

TEST(MatchSearch, LayoutsThatAreTooSmallNeverMatch)
{
  const Markers three{{0, 0, 0}, {50, 0, 0}, {0, 90, 0}};
  EXPECT_FALSE(Compare(Layout(three), Layout(three)).found) << "four markers at least";
  EXPECT_FALSE(Compare(Layout({}), Layout({})).found);
  EXPECT_TRUE(Compare(Layout(three, 3), Layout(irregular, 3)).complete);
}

TEST(MatchSearch, StopsWhenTheStepsRunOutOrWhenItIsToldTo)
{
  // Everything may be anything: a search without end.
  std::mt19937 random(3);
  std::uniform_real_distribution<double> place(0, 60);
  const auto crowd = [&]
  {
    Markers markers(40);
    for (auto& marker : markers)
      marker = {place(random), place(random), place(random)};
    return Layout(markers);
  };
  const MarkerLayout one = crowd();
  const MarkerLayout other = crowd();
  MatchSearch search;
  const Match cut = search.Run(one, other, {30, 1000});
  EXPECT_FALSE(cut.complete);
  EXPECT_EQ(cut.steps, 1000U);

  int asked = 0;
  const Match given = search.Run(one, other, unlimited, [&] { return ++asked < 5; });
  EXPECT_FALSE(given.found);
  EXPECT_FALSE(given.complete);
  EXPECT_EQ(asked, 5);

  // The same search object serves the next comparison.
  EXPECT_TRUE(search.Run(Layout(irregular), Layout(Moved(irregular)), unlimited).found);
}

namespace
{

/// Every way to give markers of one object counterparts among those of another, aligned by somebody else's code.
class BruteForce
{
public:
  BruteForce(const Markers& first, const Markers& second, std::size_t size, bool itself)
      : m_first(first), m_second(second), m_size(size), m_itself(itself)
  {
    Extend(0);
  }

  bool found = false;
  double distance = 0;

private:
  void Extend(std::size_t marker)
  {
    if (m_pairs.size() == m_size)
      return Align();
    if (marker == m_first.size())
      return;
    Extend(marker + 1);
    for (std::size_t j = 0; j < m_second.size(); ++j)
    {
      if (std::any_of(m_pairs.begin(), m_pairs.end(), [j](const auto& pair) { return pair.second == j; }))
        continue;
      m_pairs.emplace_back(marker, j);
      Extend(marker + 1);
      m_pairs.pop_back();
    }
  }

  void Align()
  {
    // Three markers that stay hold the object still: random ones are never in line.
    if (m_itself &&
        std::count_if(m_pairs.begin(), m_pairs.end(), [](const auto& pair) { return pair.first == pair.second; }) > 2)
      return;
    Eigen::Matrix3Xd from(3, m_size);
    Eigen::Matrix3Xd to(3, m_size);
    for (std::size_t i = 0; i < m_size; ++i)
    {
      from.col(static_cast<Eigen::Index>(i)) = m_first[m_pairs[i].first];
      to.col(static_cast<Eigen::Index>(i)) = m_second[m_pairs[i].second];
    }
    const Eigen::Matrix4d motion = Eigen::umeyama(from, to, false);
    const Eigen::Matrix3Xd moved = (motion * from.colwise().homogeneous()).topRows<3>();
    const Eigen::Matrix3Xd left = moved - to;
    if (m_itself && (moved - from).colwise().norm().maxCoeff() <= unlimited.reach)
      return;
    if (left.colwise().norm().maxCoeff() > unlimited.reach || (found && left.squaredNorm() >= m_squares))
      return;
    found = true;
    m_squares = left.squaredNorm();
    distance = left.colwise().norm().mean();
  }

  const Markers& m_first;
  const Markers& m_second;
  const std::size_t m_size;
  const bool m_itself;
  double m_squares = 0;
  std::vector<std::pair<std::size_t, std::size_t>> m_pairs;
};

}

TEST(MatchSearch, FindsWhatTryingEverythingFinds)
{
  std::mt19937 random(11);
  std::uniform_int_distribution<std::size_t> counts(4, 6);
  int found = 0;
  int missed = 0;
  const auto check = [&](const Match& match, const BruteForce& wanted, int round)
  {
    ASSERT_EQ(match.found, wanted.found) << "round " << round;
    ASSERT_TRUE(match.complete);
    ASSERT_NEAR(match.distance, wanted.distance, 1e-6) << "round " << round;
    ++(wanted.found ? found : missed);
  };
  for (int round = 0; round < 120; ++round)
  {
    // Small objects, in which much resembles much, and large ones; some a distorted part of the other.
    std::uniform_real_distribution<double> place(0, round % 3 == 0 ? 40 : round % 3 == 1 ? 80 : 200);
    std::normal_distribution<double> error(0, 3);
    const auto make = [&](std::size_t count)
    {
      Markers markers(count);
      for (auto& marker : markers)
        marker = {place(random), place(random), place(random)};
      return markers;
    };
    const bool large = round % 20 == 0;
    const Markers first = make(large ? 7 : counts(random));
    Markers second = make(large ? 7 : counts(random));
    if (round % 2 == 1)
      for (std::size_t i = 0; i < std::min(first.size(), second.size()); ++i)
        second[i] = first[i] + Vector3d(error(random), error(random), error(random));
    second = Moved(second);
    const std::size_t threshold = std::max<std::size_t>(4, first.size() - static_cast<std::size_t>(round % 3));
    check(Compare(Layout(first, threshold), Layout(second)), BruteForce(first, second, threshold, false), round);
    if (!large)
      check(CompareViews(Layout(first, threshold)), BruteForce(first, first, threshold, true), round);
  }
  EXPECT_GT(found, 50);
  EXPECT_GT(missed, 50);
}
