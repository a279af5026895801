// Every comparison among 50 objects of 8 to 15 markers: by the search that the host uses, and by a plain depth-first
// search that aligns whatever pairs of markers keep their distances. Both have to find the same.

#include "StandaloneHost/Evaluation/MatchSearch.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cmath>
#include <limits>
#include <random>
#include <vector>

using Evaluation::MarkerLayout;
using Evaluation::Match;
using Evaluation::SearchLimits;

namespace
{

constexpr SearchLimits limits{10.0, std::numeric_limits<std::uint64_t>::max()};

/// Markers at random in a box of that size (mm), 25 mm apart at least, as on a prop.
std::vector<Eigen::Vector3d> RandomMarkers(std::mt19937& random, const Eigen::Vector3d& box, std::size_t count)
{
  std::uniform_real_distribution<double> unit(-0.5, 0.5);
  std::vector<Eigen::Vector3d> markers;
  while (markers.size() < count)
  {
    const Eigen::Vector3d marker = box.cwiseProduct(Eigen::Vector3d(unit(random), unit(random), unit(random)));
    if (std::all_of(markers.begin(), markers.end(), [&](const auto& known) { return (known - marker).norm() >= 25; }))
      markers.push_back(marker);
  }
  return markers;
}

/// A stage of props: each fifth one looks much like the one before it.
std::vector<MarkerLayout> Objects(double size)
{
  std::mt19937 random(7);
  std::uniform_int_distribution<std::size_t> counts(8, 15);
  std::normal_distribution<double> error(0, 2);
  std::vector<MarkerLayout> objects;
  for (int i = 0; i < 50; ++i)
  {
    auto markers = RandomMarkers(random, size * Eigen::Vector3d(1, 0.8, 0.4), counts(random));
    if (i % 5 == 4)
    {
      markers = objects.back().Markers();
      for (auto& marker : markers)
        marker += Eigen::Vector3d(error(random), error(random), error(random));
      std::shuffle(markers.begin(), markers.end(), random);
    }
    const std::size_t threshold = MarkerLayout::DefaultEntranceThreshold(markers.size());
    objects.emplace_back(std::move(markers), threshold);
  }
  return objects;
}

/// Depth-first, marker by marker in their order; an alignment for every full set of pairs.
class PlainSearch
{
public:
  Match Run(const MarkerLayout& first, const MarkerLayout& second)
  {
    m_first = &first;
    m_second = &second;
    m_match = {};
    m_best = static_cast<double>(first.EntranceThreshold()) * limits.reach * limits.reach;
    m_taken.assign(second.Size(), false);
    Extend(0);
    return m_match;
  }

private:
  void Extend(std::size_t marker)
  {
    const std::size_t size = m_first->EntranceThreshold();
    if (m_pairs.size() == size)
      return Confirm();
    if (marker == m_first->Size())
      return;
    for (std::size_t j = 0; j < m_second->Size(); ++j)
    {
      const auto compatible = [&](const auto& pair)
      {
        return std::abs(m_first->Distance(marker, pair.first) - m_second->Distance(j, pair.second)) <= 2 * limits.reach;
      };
      if (m_taken[j] || !std::all_of(m_pairs.begin(), m_pairs.end(), compatible))
        continue;
      m_taken[j] = true;
      m_pairs.emplace_back(marker, j);
      Extend(marker + 1);
      m_pairs.pop_back();
      m_taken[j] = false;
    }
    if (m_pairs.size() + m_first->Size() - marker > size)
      Extend(marker + 1);
  }

  void Confirm()
  {
    m_from.clear();
    m_to.clear();
    for (const auto& [i, j] : m_pairs)
    {
      m_from.push_back(m_first->Markers()[i]);
      m_to.push_back(m_second->Markers()[j]);
    }
    const auto alignment = Evaluation::Align(m_from, m_to);
    if (alignment.squares >= m_best || alignment.largest > limits.reach)
      return;
    m_best = alignment.squares;
    m_match.found = true;
    m_match.distance = alignment.mean;
  }

  const MarkerLayout* m_first = nullptr;
  const MarkerLayout* m_second = nullptr;
  double m_best = 0;
  Match m_match;
  std::vector<std::pair<std::size_t, std::size_t>> m_pairs;
  std::vector<bool> m_taken;
  std::vector<Eigen::Vector3d> m_from;
  std::vector<Eigen::Vector3d> m_to;
};

template <class Compare>
std::vector<Match> CompareAll(const std::vector<MarkerLayout>& objects, Compare compare)
{
  std::vector<Match> matches;
  for (const auto& first : objects)
    for (const auto& second : objects)
      if (&first != &second)
        matches.push_back(compare(first, second));
  return matches;
}

std::vector<Match> WithTheEngine(const std::vector<MarkerLayout>& objects)
{
  Evaluation::MatchSearch search;
  return CompareAll(objects, [&](const auto& first, const auto& second) { return search.Run(first, second, limits); });
}

std::vector<Match> Plainly(const std::vector<MarkerLayout>& objects)
{
  PlainSearch search;
  return CompareAll(objects, [&](const auto& first, const auto& second) { return search.Run(first, second); });
}

void LookAlikesPlainDepthFirst(benchmark::State& state)
{
  const auto objects = Objects(static_cast<double>(state.range(0)));
  for (auto _ : state)
    benchmark::DoNotOptimize(Plainly(objects));
}

void LookAlikes(benchmark::State& state)
{
  const auto objects = Objects(static_cast<double>(state.range(0)));
  const auto wanted = Plainly(objects);
  std::vector<Match> matches;
  for (auto _ : state)
    matches = WithTheEngine(objects);
  for (std::size_t i = 0; i < matches.size(); ++i)
    if (matches[i].found != wanted[i].found || std::abs(matches[i].distance - wanted[i].distance) > 1e-9)
      return state.SkipWithError("the plain search finds something else");
  state.counters["found"] = static_cast<double>(
      std::count_if(matches.begin(), matches.end(), [](const Match& match) { return match.found; }));
  state.counters["mostSteps"] =
      static_cast<double>(std::max_element(matches.begin(), matches.end(),
                                           [](const Match& one, const Match& other) { return one.steps < other.steps; })
                              ->steps);
}

}

// The argument is the size of the objects in mm.
BENCHMARK(LookAlikesPlainDepthFirst)->Arg(100)->Arg(150)->Arg(200)->Arg(300)->Unit(benchmark::kMillisecond);
BENCHMARK(LookAlikes)->Arg(100)->Arg(150)->Arg(200)->Arg(300)->Unit(benchmark::kMillisecond);
