#include "StandaloneHost/Evaluation/MarkerLayout.h"

#include <algorithm>
#include <functional>
#include <numeric>
#include <utility>

namespace Evaluation
{

MarkerLayout::MarkerLayout(std::vector<Eigen::Vector3d> markers, std::size_t entranceThreshold)
    : m_markers(std::move(markers)), m_entranceThreshold(entranceThreshold)
{
  Eigen::Vector3d centroid = Eigen::Vector3d::Zero();
  for (const auto& marker : m_markers)
    centroid += marker / static_cast<double>(m_markers.size());
  for (auto& marker : m_markers)
    marker -= centroid;
  std::sort(m_markers.begin(), m_markers.end(),
            [](const auto& one, const auto& other) { return one.squaredNorm() > other.squaredNorm(); });
  m_distances.reserve(m_markers.size() * m_markers.size());
  for (const auto& one : m_markers)
    for (const auto& other : m_markers)
      m_distances.push_back((one - other).norm());

  const double longest = m_distances.empty() ? 0 : *std::max_element(m_distances.begin(), m_distances.end());
  m_bucketsPerMillimetre = longest > 0 ? buckets / longest : 0;
  m_nearer.assign(m_markers.size() * (buckets + 1), 0);
  for (std::size_t marker = 0; marker < m_markers.size(); ++marker)
  {
    Mask* nearer = &m_nearer[marker * (buckets + 1)];
    for (std::size_t other = 0; other < m_markers.size(); ++other)
      if (other != marker)
        nearer[Bucket(Distance(marker, other)) + 1] |= Mask{1} << other;
    std::partial_sum(nearer, nearer + buckets + 1, nearer, std::bit_or<>());
  }
}

std::size_t MarkerLayout::DefaultEntranceThreshold(std::size_t markerCount)
{
  return std::max<std::size_t>(4, markerCount == 0 ? 0 : markerCount - 1);
}

}
