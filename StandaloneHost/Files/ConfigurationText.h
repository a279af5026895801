#pragma once

#include "StoreInterface/IStoreReader.h"

#include <string>

namespace Files
{

/// The text of a configuration file with all devices, presets and subjects of the store, without what has its default
/// value. Throws ConfigurationError when something cannot be written. [any]
[[nodiscard]] std::string ConfigurationText(const NMX::IStoreReader& store);

/// The same with the subject and everything beneath it, and nothing else. What they refer to elsewhere is left out.
/// `InvalidId` when there is no such subject.
[[nodiscard]] std::string ConfigurationText(const NMX::IStoreReader& store, NMX::TSubjectStoreId subject);

}
