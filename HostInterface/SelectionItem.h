#pragma once

#include "HostInterface/NMX/ITypedId.h"

#include <cstdint>
#include <string>

/// One thing that can be selected: a subject, a slot of a character, or a device.
struct SelectionItem
{
  NMX::TSubjectStoreId subject; ///< the invalid id for a device
  std::int32_t slot = -1;       ///< position of a slot of that subject; -1 for the subject itself
  std::string device;           ///< URN; empty unless it is a device

  friend bool operator==(const SelectionItem&, const SelectionItem&) = default;
};
