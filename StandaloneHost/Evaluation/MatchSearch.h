#pragma once

#include "StandaloneHost/Evaluation/Alignment.h"
#include "StandaloneHost/Evaluation/MarkerLayout.h"

#include <array>
#include <cstdint>
#include <functional>
#include <vector>

namespace Evaluation
{

/// What a comparison of one layout with another has found.
struct Match
{
  bool found = false;
  bool complete = true;    ///< false when the steps ran out: there may be a closer match
  double distance = 0;     ///< mean displacement (mm) of the closest match, when one was found
  std::uint64_t steps = 0; ///< how many pairs of markers were tried
};

/// How far a comparison goes.
struct SearchLimits
{
  double reach = 0; ///< how far (mm) from its counterpart a marker may end up
  std::uint64_t maximumSteps = 0;
};

/// Looks for the closest match of one layout in another.
///
/// A match gives `EntranceThreshold()` markers of the first layout each a counterpart among the markers of the second,
/// no two the same, and a rigid motion that brings each of them within `reach` of its counterpart. The closest match is
/// the one with the least sum of squared displacements. To ask for more markers than the threshold would be of no use:
/// every match of more contains one of the threshold that is at least as close.
///
/// Branch and bound: markers get counterparts one after the other, the one with the fewest candidates first. A marker's
/// candidates keep the distances to the markers before it. A branch is cut off when more markers have lost all of their
/// candidates than the match may do without, or when the pairs chosen so far already leave too much displacement. One
/// search at a time. [worker]
class MatchSearch
{
public:
  /// Asked every few steps; false gives the search up.
  using KeepGoing = std::function<bool()>;

  /// Compares two objects. A search that was given up has found nothing.
  Match Run(const MarkerLayout& first, const MarkerLayout& second, const SearchLimits& limits,
            const KeepGoing& keepGoing = {});

  /// Compares an object with its own other views: a match has to move one of its markers further than the reach, and
  /// those that keep their places must not hold the object still.
  Match RunOnItself(const MarkerLayout& layout, const SearchLimits& limits, const KeepGoing& keepGoing = {});

private:
  /// The state after so many pairs.
  struct Level
  {
    PairSums sums;
    std::array<Mask, maximumMarkers> candidates; ///< the counterparts that each marker may still get
  };

  void Search(const SearchLimits& limits, const KeepGoing& keepGoing);
  void Extend(std::size_t depth, Mask remaining, std::size_t skips);
  void TryCounterparts(std::size_t depth, std::size_t marker, Mask remaining, std::size_t skips);
  bool Enter(std::size_t depth, std::size_t marker, std::size_t counterpart, Mask remaining, std::size_t skips);
  void Confirm();
  [[nodiscard]] bool HeldStill() const;
  [[nodiscard]] bool Stopped();

  const MarkerLayout* m_first = nullptr;
  const MarkerLayout* m_second = nullptr;
  bool m_itself = false;
  SearchLimits m_limits;
  const KeepGoing* m_keepGoing = nullptr;
  std::size_t m_size = 0; // markers in a match
  double m_best = 0;      // squares to be beaten
  bool m_stopped = false;
  Match m_match;
  double m_tolerance = 0; // how much the distances of two markers and of their counterparts may differ
  std::vector<Level> m_levels;
  std::vector<std::size_t> m_chosen;       // markers of the first layout…
  std::vector<std::size_t> m_counterparts; // …and their counterparts
};

}
