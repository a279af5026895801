#include "StandaloneHost/Evaluation/EvaluatedObject.h"

#include "StoreInterface/EntryPaths.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace Evaluation
{

namespace
{

/// The value of an entry, where the object has it as a `T`.
template <class T>
const T* Find(const NMX::IStoreReader& reader, NMX::TSubjectStoreId id, NMX::EntryPath path)
{
  const NMX::Value* value = nullptr;
  return reader.Find(id, path, value).Succeeded() && value != nullptr ? std::get_if<T>(value) : nullptr;
}

/// The aspects of an object that evaluation depends on.
constexpr NMX::EAspect evaluatedAspects[] = {NMX::EAspect::Parameters, NMX::EAspect::Markers,
                                             NMX::EAspect::SmartClusters};

bool Comparable(const std::vector<NMX::Position>& positions)
{
  const auto near = [](double coordinate) { return std::abs(coordinate) <= largestCoordinate; };
  return positions.size() <= maximumMarkers &&
         std::all_of(positions.begin(), positions.end(),
                     [&](const NMX::Position& place) { return near(place.x) && near(place.y) && near(place.z); });
}

}

EvaluatedObject ReadObject(const NMX::IStoreReader& reader, NMX::TSubjectStoreId id)
{
  EvaluatedObject object;
  const bool* enabled = Find<bool>(reader, id, NMX::Paths::Enabled());
  object.enabled = enabled != nullptr && *enabled;

  // A basic object has the one, a smart object the other.
  for (const NMX::EntryPath& path : {NMX::Paths::Markers(), NMX::Paths::AdditionalMarkerPositions()})
  {
    const auto* positions = Find<std::vector<NMX::Position>>(reader, id, path);
    if (positions == nullptr)
      continue;
    object.comparable = Comparable(*positions);
    if (object.comparable)
      for (const NMX::Position& place : *positions)
        object.markers.emplace_back(place.x, place.y, place.z);
  }
  const auto* chosen = Find<std::uint32_t>(reader, id, NMX::Paths::EntranceThreshold());
  object.entranceThreshold =
      chosen != nullptr && *chosen != 0 ? *chosen : MarkerLayout::DefaultEntranceThreshold(object.markers.size());
  return object;
}

std::shared_ptr<const MarkerLayout> MakeLayout(EvaluatedObject object)
{
  if (!object.enabled || !object.comparable)
    return nullptr;
  return std::make_shared<const MarkerLayout>(std::move(object.markers), object.entranceThreshold);
}

bool MayDiffer(const NMX::ChangeStamps& before, const NMX::ChangeStamps& now)
{
  return std::any_of(std::begin(evaluatedAspects), std::end(evaluatedAspects),
                     [&](NMX::EAspect aspect)
                     {
                       const auto index = static_cast<std::size_t>(aspect);
                       return before[index] != now[index];
                     });
}

}
