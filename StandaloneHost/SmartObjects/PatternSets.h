#pragma once

#include "StoreInterface/IEntryEditor.h"

#include <array>
#include <cstdint>
#include <string_view>

namespace SmartObjects
{

/// How many patterns the sets have that a type of device can be switched to. Within a set they are numbered from 1.
inline constexpr std::array<std::uint32_t, 4> patternSetSizes{8, 16, 32, 64};

/// The size of the set that the devices of a type use at present.
[[nodiscard]] std::uint32_t CurrentPatternSet(const NMX::IStoreReader& access, std::string_view type);

/// Gives each cluster of the smart objects a pattern of its own, from the smallest set that has enough for its type.
/// Clusters that have a pattern of that set already, which no object before them has, keep it; those beyond the largest
/// set get 0. `NotSupported` when there are clusters of several types: no set serves them together.
NMX::IResult AssignPatterns(NMX::IEntryEditor& editor);

}
