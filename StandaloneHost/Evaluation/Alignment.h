#pragma once

#include <Eigen/Core>

#include <span>

namespace Evaluation
{

/// Sums over pairs of places from which the rigid motion that brings the first ones closest to the second ones follows.
/// Adding a pair costs the same however many there are.
class PairSums
{
public:
  [[nodiscard]] PairSums With(const Eigen::Vector3d& from, const Eigen::Vector3d& to) const;

  /// A value that is not greater than the sum of squared displacements (mm²) that the best motion leaves, and hardly
  /// less: in closed form, quick rather than exact.
  [[nodiscard]] double LeastSquares() const;

private:
  double m_count = 0;
  double m_squares = 0; // of both sides
  Eigen::Vector3d m_from = Eigen::Vector3d::Zero();
  Eigen::Vector3d m_to = Eigen::Vector3d::Zero();
  Eigen::Matrix3d m_products = Eigen::Matrix3d::Zero();
};

/// The rigid motion that brings places closest, in the sense of least squares, to their counterparts, and what it
/// leaves.
struct Alignment
{
  Eigen::Matrix3d rotation = Eigen::Matrix3d::Identity();
  Eigen::Vector3d translation = Eigen::Vector3d::Zero();
  double squares = 0; ///< sum of the squared displacements (mm²)
  double mean = 0;    ///< mean displacement (mm)
  double largest = 0; ///< largest displacement (mm)
};

/// Aligns `from` with `to`, each with its counterpart of the same index; at least one. Reflections are no motions.
[[nodiscard]] Alignment Align(std::span<const Eigen::Vector3d> from, std::span<const Eigen::Vector3d> to);

}
