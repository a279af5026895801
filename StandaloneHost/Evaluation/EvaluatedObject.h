#pragma once

#include "StandaloneHost/Evaluation/MarkerLayout.h"
#include "StoreInterface/IStoreReader.h"

#include <array>
#include <memory>
#include <vector>

namespace Evaluation
{

/// The kinds of subject that are objects.
inline constexpr std::array objectKinds{NMX::ESubjectKind::BasicObjects, NMX::ESubjectKind::SmartObjects};

/// What evaluation needs to know of an object of the store.
struct EvaluatedObject
{
  bool enabled = false;
  bool comparable = true; ///< false when its markers are too many, or too far apart; then they are left out
  std::vector<Eigen::Vector3d> markers;
  std::size_t entranceThreshold = 0;
};

/// Reads a basic or smart object.
[[nodiscard]] EvaluatedObject ReadObject(const NMX::IStoreReader& reader, NMX::TSubjectStoreId id);

/// The layout of an object that takes part in evaluation; null for one that does not.
[[nodiscard]] std::shared_ptr<const MarkerLayout> MakeLayout(EvaluatedObject object);

/// Whether the object may have become another one for evaluation between these stamps.
[[nodiscard]] bool MayDiffer(const NMX::ChangeStamps& before, const NMX::ChangeStamps& now);

}
