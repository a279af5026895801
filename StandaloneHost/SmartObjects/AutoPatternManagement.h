#pragma once

#include "HostInterface/ISmartObjectControls.h"
#include "HostInterface/NMX/IPostalService.h"
#include "StoreInterface/IStore.h"

#include <memory>

namespace SmartObjects
{

/// Assigns patterns whenever smart objects have changed, while automatic pattern management is on. Ends when the
/// returned object is destroyed.
[[nodiscard]] std::shared_ptr<const void> ManagePatterns(const std::shared_ptr<NMX::IStore>& store,
                                                         const std::shared_ptr<ISmartObjectControls>& controls,
                                                         const std::shared_ptr<NMX::IPostalService>& postal);

}
