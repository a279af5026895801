#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StoreInterface/IEntryEditor.h"

#include <cstdint>
#include <span>

/// Moving clusters between smart objects. Each operation has its rule as a function of its own, so that what is offered
/// is what is accepted. Ids come once each.
namespace Subjects
{

/// Two or more smart objects: `InvalidArgument` otherwise.
NMX::IResult CheckMerge(const NMX::IStoreReader& access, std::span<const NMX::TSubjectStoreId> objects);

/// Moves the clusters of all to the first, in this order, and removes the others. A label that the first has already
/// gets a number.
NMX::IResult Merge(NMX::IEntryEditor& editor, std::span<const NMX::TSubjectStoreId> objects);

/// One or more smart objects, one of which has more than one cluster: `InvalidArgument` otherwise.
NMX::IResult CheckSplit(const NMX::IStoreReader& access, std::span<const NMX::TSubjectStoreId> objects);

/// Leaves each object its first cluster, and makes a smart object of each of the others, with the colour, the groups
/// and the enabled state of the one that it came from and its name followed by the cluster's label.
NMX::IResult Split(NMX::IEntryEditor& editor, std::span<const NMX::TSubjectStoreId> objects);

/// Two smart objects with clusters, or one with two of them: `InvalidArgument` otherwise.
NMX::IResult CheckSwap(const NMX::IStoreReader& access, NMX::TSubjectStoreId first, NMX::TSubjectStoreId second);

/// Exchanges two clusters. `InvalidIndex` for one that is not there.
NMX::IResult Swap(NMX::IEntryEditor& editor, NMX::TSubjectStoreId first, std::uint32_t firstIndex,
                  NMX::TSubjectStoreId second, std::uint32_t secondIndex);

}
