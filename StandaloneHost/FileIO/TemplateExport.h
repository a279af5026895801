#pragma once

#include "StoreInterface/IStore.h"

#include <filesystem>

namespace FileIO
{

/// Writes a template from which such a subject can be made: a smart object's clusters and additional markers; a
/// character's slots and roles, on a skeleton of one segment for each slot, as the store keeps none; a general
/// subject's role and the props and labelling clusters beneath it, on the skeleton of the template that it was made
/// from. Throws Files::ConfigurationError: `InvalidId`, `NotSupported` for other kinds and for a general subject whose
/// template cannot be read, and what Files::WriteWholeFile throws. [any]
void ExportTemplate(const NMX::IStore& store, NMX::TSubjectStoreId subject, const std::filesystem::path& file);

}
