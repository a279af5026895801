#include "StandaloneHost/Evaluation/Alignment.h"

#include <Eigen/Eigenvalues>
#include <Eigen/LU>
#include <Eigen/SVD>

#include <algorithm>
#include <cmath>

namespace Evaluation
{

PairSums PairSums::With(const Eigen::Vector3d& from, const Eigen::Vector3d& to) const
{
  PairSums sums(*this);
  sums.m_count += 1;
  sums.m_squares += from.squaredNorm() + to.squaredNorm();
  sums.m_from += from;
  sums.m_to += to;
  sums.m_products.noalias() += from * to.transpose();
  return sums;
}

double PairSums::LeastSquares() const
{
  // With both sides centred, the best motion leaves |from|² + |to|² - 2 (s1 + s2 ± s3), where s are the singular values
  // of the products and the sign is that of their determinant: a negative one would be a reflection.
  const double squares = m_squares - (m_from.squaredNorm() + m_to.squaredNorm()) / m_count;
  const Eigen::Matrix3d products = m_products - m_from * m_to.transpose() / m_count;
  Eigen::SelfAdjointEigenSolver<Eigen::Matrix3d> solver;
  solver.computeDirect(products.transpose() * products, Eigen::EigenvaluesOnly);
  const Eigen::Vector3d singular = solver.eigenvalues().cwiseMax(0).cwiseSqrt(); // ascending
  const double gained = singular[2] + singular[1] + (products.determinant() < 0 ? -singular[0] : singular[0]);
  // The square root of a small eigenvalue is good to about half of a double's digits.
  constexpr double tolerance = 1e-6;
  return squares * (1 - tolerance) - 2 * gained;
}

Alignment Align(std::span<const Eigen::Vector3d> from, std::span<const Eigen::Vector3d> to)
{
  const auto count = static_cast<double>(from.size());
  Eigen::Vector3d fromCentre = Eigen::Vector3d::Zero();
  Eigen::Vector3d toCentre = Eigen::Vector3d::Zero();
  for (std::size_t i = 0; i < from.size(); ++i)
  {
    fromCentre += from[i] / count;
    toCentre += to[i] / count;
  }
  Eigen::Matrix3d products = Eigen::Matrix3d::Zero();
  for (std::size_t i = 0; i < from.size(); ++i)
    products.noalias() += (from[i] - fromCentre) * (to[i] - toCentre).transpose();

  const Eigen::JacobiSVD<Eigen::Matrix3d> svd(products, Eigen::ComputeFullU | Eigen::ComputeFullV);
  Eigen::Matrix3d flip = Eigen::Matrix3d::Identity();
  if ((svd.matrixV() * svd.matrixU().transpose()).determinant() < 0)
    flip(2, 2) = -1;

  Alignment alignment;
  alignment.rotation = svd.matrixV() * flip * svd.matrixU().transpose();
  alignment.translation = toCentre - alignment.rotation * fromCentre;
  for (std::size_t i = 0; i < from.size(); ++i)
  {
    const double displacement = (alignment.rotation * from[i] + alignment.translation - to[i]).norm();
    alignment.squares += displacement * displacement;
    alignment.mean += displacement / count;
    alignment.largest = std::max(alignment.largest, displacement);
  }
  return alignment;
}

}
