#pragma once

#include "StandaloneHost/Evaluation/MarkerLayout.h"
#include "StoreInterface/IStoreReader.h"

#include <array>
#include <memory>

namespace Evaluation
{

/// The kinds of subject that are objects.
inline constexpr std::array objectKinds{NMX::ESubjectKind::BasicObjects, NMX::ESubjectKind::SmartObjects};

/// An object of the store as evaluation sees it.
struct EvaluatedObject
{
  bool enabled = false;
  std::shared_ptr<const MarkerLayout> layout; ///< null when its markers cannot be compared: too many, or too far apart
};

/// Reads a basic or smart object.
[[nodiscard]] EvaluatedObject ReadObject(const NMX::IStoreReader& reader, NMX::TSubjectStoreId id);

/// Whether the object may have become another one for evaluation between these stamps.
[[nodiscard]] bool MayDiffer(const NMX::ChangeStamps& before, const NMX::ChangeStamps& now);

}
