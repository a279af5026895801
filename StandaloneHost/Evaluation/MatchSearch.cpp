#include "StandaloneHost/Evaluation/MatchSearch.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <limits>
#include <utility>

namespace Evaluation
{

namespace
{

constexpr std::uint64_t stepsBetweenQuestions = 64;

/// Displacements (mm) that are nothing but rounding: no match is closer.
constexpr double exact = 1e-6;

Mask AllMarkers(std::size_t count)
{
  return count >= maximumMarkers ? ~Mask{0} : (Mask{1} << count) - 1;
}

}

Match MatchSearch::Run(const MarkerLayout& first, const MarkerLayout& second, const SearchLimits& limits,
                       const KeepGoing& keepGoing)
{
  m_first = &first;
  m_second = &second;
  m_itself = false;
  Search(limits, keepGoing);
  return m_match;
}

Match MatchSearch::RunOnItself(const MarkerLayout& layout, const SearchLimits& limits, const KeepGoing& keepGoing)
{
  m_first = &layout;
  m_second = &layout;
  m_itself = true;
  Search(limits, keepGoing);
  return m_match;
}

void MatchSearch::Search(const SearchLimits& limits, const KeepGoing& keepGoing)
{
  m_limits = limits;
  m_keepGoing = &keepGoing;
  m_size = m_first->EntranceThreshold();
  m_stopped = false;
  m_match = {};
  if (m_size == 0 || m_size > m_first->Size() || m_size > m_second->Size())
    return;

  m_best = static_cast<double>(m_size) * limits.reach * limits.reach;
  m_tolerance = 2 * limits.reach;
  m_chosen.clear();
  m_counterparts.clear();
  m_levels.resize(std::max(m_levels.size(), m_size + 1));
  m_levels[0].sums = {};
  m_levels[0].candidates.fill(AllMarkers(m_second->Size()));
  Extend(0, AllMarkers(m_first->Size()), m_first->Size() - m_size);
}

bool MatchSearch::Stopped()
{
  if (m_stopped)
    return true;
  if (m_match.steps >= m_limits.maximumSteps)
  {
    m_match.complete = false;
    return m_stopped = true;
  }
  if (m_match.steps % stepsBetweenQuestions == 0 && *m_keepGoing && !(*m_keepGoing)())
  {
    m_match = {.complete = false};
    return m_stopped = true;
  }
  ++m_match.steps;
  return false;
}

/// Chooses the next marker and tries its counterparts, and then to do without it.
void MatchSearch::Extend(std::size_t depth, Mask remaining, std::size_t skips)
{
  if (depth == m_size)
    return Confirm();
  const auto& candidates = m_levels[depth].candidates;
  for (;;)
  {
    // The marker with the fewest candidates decides soonest whether this leads anywhere.
    std::size_t marker = 0;
    int fewest = std::numeric_limits<int>::max();
    for (Mask left = remaining; left != 0 && fewest > 1; left &= left - 1)
    {
      const auto i = static_cast<std::size_t>(std::countr_zero(left));
      if (const int count = std::popcount(candidates[i]); count < fewest)
      {
        fewest = count;
        marker = i;
      }
    }
    remaining &= ~(Mask{1} << marker);
    TryCounterparts(depth, marker, remaining, skips);
    if (m_stopped || skips == 0)
      return;
    --skips;
  }
}

void MatchSearch::TryCounterparts(std::size_t depth, std::size_t marker, Mask remaining, std::size_t skips)
{
  // The likeliest first: the sooner a close match is known, the more is cut off.
  std::array<std::pair<double, std::size_t>, maximumMarkers> counterparts;
  std::size_t count = 0;
  for (Mask left = m_levels[depth].candidates[marker]; left != 0; left &= left - 1)
  {
    const auto candidate = static_cast<std::size_t>(std::countr_zero(left));
    double differences = 0;
    for (std::size_t i = 0; i < depth; ++i)
      differences +=
          std::abs(m_first->Distance(marker, m_chosen[i]) - m_second->Distance(candidate, m_counterparts[i]));
    counterparts[count++] = {differences, candidate};
  }
  if (depth > 0)
    std::sort(counterparts.begin(), counterparts.begin() + count);

  for (std::size_t i = 0; i < count; ++i)
  {
    if (Stopped())
      return;
    m_chosen.push_back(marker);
    m_counterparts.push_back(counterparts[i].second);
    if (Enter(depth + 1, marker, counterparts[i].second, remaining, skips))
      Extend(depth + 1, remaining, skips);
    m_chosen.pop_back();
    m_counterparts.pop_back();
    if (m_stopped)
      return;
  }
}

/// Makes the state after one more pair; false when no match that has these pairs can be closer than the best so far.
bool MatchSearch::Enter(std::size_t depth, std::size_t marker, std::size_t counterpart, Mask remaining,
                        std::size_t skips)
{
  if (m_itself && HeldStill())
    return false;
  const Level& before = m_levels[depth - 1];
  Level& level = m_levels[depth];
  std::size_t lost = 0;
  for (Mask left = remaining; left != 0; left &= left - 1)
  {
    const auto i = static_cast<std::size_t>(std::countr_zero(left));
    level.candidates[i] = before.candidates[i] & m_second->Near(counterpart, m_first->Distance(marker, i), m_tolerance);
    if (level.candidates[i] == 0 && ++lost > skips)
      return false;
  }
  // In a match each of these pairs is within reach, so that the motion that is best for them alone leaves no more.
  level.sums = before.sums.With(m_first->Markers()[marker], m_second->Markers()[counterpart]);
  return depth < 3 ||
         level.sums.LeastSquares() < std::min(m_best, static_cast<double>(depth) * m_limits.reach * m_limits.reach);
}

/// Takes the pairs chosen as the closest match so far, if they are.
void MatchSearch::Confirm()
{
  std::array<Eigen::Vector3d, maximumMarkers> from;
  std::array<Eigen::Vector3d, maximumMarkers> to;
  for (std::size_t i = 0; i < m_size; ++i)
  {
    from[i] = m_first->Markers()[m_chosen[i]];
    to[i] = m_second->Markers()[m_counterparts[i]];
  }
  const Alignment alignment = Align({from.data(), m_size}, {to.data(), m_size});
  if (alignment.squares >= m_best || alignment.largest > m_limits.reach)
    return;
  const auto moves = [&](const Eigen::Vector3d& place)
  { return (alignment.rotation * place + alignment.translation - place).norm() > m_limits.reach; };
  if (m_itself && std::none_of(from.begin(), from.begin() + m_size, moves))
    return;
  m_best = alignment.squares;
  // Each of two displacements can take up half of a difference.
  m_tolerance = std::min(m_tolerance, std::sqrt(2 * m_best));
  m_match.found = true;
  m_match.distance = alignment.mean;
  m_stopped = alignment.largest <= exact;
}

/// Whether three markers, not in line, have kept their places: then the object has not moved.
bool MatchSearch::HeldStill() const
{
  const Eigen::Vector3d* point = nullptr;
  Eigen::Vector3d direction = Eigen::Vector3d::Zero();
  for (std::size_t i = 0; i < m_chosen.size(); ++i)
  {
    if (m_first->Distance(m_chosen[i], m_counterparts[i]) > sameSpot)
      continue;
    const Eigen::Vector3d& place = m_first->Markers()[m_chosen[i]];
    if (point == nullptr)
    {
      point = &place;
      continue;
    }
    const Eigen::Vector3d offset = place - *point;
    if ((offset - offset.dot(direction) * direction).norm() <= sameSpot)
      continue;
    if (!direction.isZero())
      return true;
    direction = offset.normalized();
  }
  return false;
}

}
