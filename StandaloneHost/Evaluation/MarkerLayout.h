#pragma once

#include <Eigen/Core>

#include <cstddef>
#include <cstdint>
#include <vector>

namespace Evaluation
{

/// Markers nearer than this to each other, or to a line, are taken to be in the same place, or on it (mm).
inline constexpr double sameSpot = 1.0;

/// An object with more markers than this is not compared with others.
inline constexpr std::size_t maximumMarkers = 64;

/// Nor one with a marker further (mm) than this from its origin on any axis.
inline constexpr double largestCoordinate = 1e6;

/// A set of markers of one object, one bit for each.
using Mask = std::uint64_t;

/// The markers of an object as the search for look-alikes needs them. Constant once made. [any]
class MarkerLayout
{
public:
  /// `markers` in mm, finite, at most `maximumMarkers`. The object is recognised once `entranceThreshold` of its
  /// markers are seen.
  MarkerLayout(std::vector<Eigen::Vector3d> markers, std::size_t entranceThreshold);

  /// How many markers an object needs that says nothing about it: all but one, and never less than four.
  [[nodiscard]] static std::size_t DefaultEntranceThreshold(std::size_t markerCount);

  /// The places relative to their centroid, the farthest from it first.
  [[nodiscard]] const std::vector<Eigen::Vector3d>& Markers() const { return m_markers; }
  [[nodiscard]] std::size_t Size() const { return m_markers.size(); }
  [[nodiscard]] std::size_t EntranceThreshold() const { return m_entranceThreshold; }
  [[nodiscard]] double Distance(std::size_t one, std::size_t other) const
  {
    return m_distances[one * m_markers.size() + other];
  }

  /// At least the markers whose distance from `marker` is within `tolerance` of `distance`, and few others: one bit for
  /// each. Takes the same short time however many there are.
  [[nodiscard]] Mask Near(std::size_t marker, double distance, double tolerance) const
  {
    const Mask* nearer = &m_nearer[marker * (buckets + 1)];
    return nearer[Bucket(distance + tolerance) + 1] & ~nearer[Bucket(distance - tolerance)];
  }

  friend bool operator==(const MarkerLayout& one, const MarkerLayout& other)
  {
    return one.m_entranceThreshold == other.m_entranceThreshold && one.m_markers == other.m_markers;
  }

private:
  static constexpr std::size_t buckets = 128;

  /// The bucket of a distance: the last one when it is greater than any here.
  [[nodiscard]] std::size_t Bucket(double distance) const
  {
    const double scaled = distance * m_bucketsPerMillimetre;
    return scaled <= 0 ? 0 : scaled >= buckets - 1 ? buckets - 1 : static_cast<std::size_t>(scaled);
  }

  std::vector<Eigen::Vector3d> m_markers;
  std::vector<double> m_distances;
  double m_bucketsPerMillimetre = 0;
  std::vector<Mask> m_nearer; // for each marker, the markers in the buckets before each bucket
  std::size_t m_entranceThreshold;
};

}
