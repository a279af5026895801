#pragma once

#include "HostInterface/IFileLocations.h"
#include "HostInterface/NMX/IResult.h"
#include "SubjectStoreUI/VSubjectStoreQml.h"

#include <filesystem>
#include <string>
#include <vector>

/// The files that the panel offers, by what they are of. [any]
namespace SubjectStoreUI::FileTypes
{

using EFileType = VSubjectStoreQml::ESubjectFileType;

/// The files of that type in the host's folders, each folder's in the order of their names, those of the user last. A
/// file of a later folder takes the place of one with the same name.
[[nodiscard]] std::vector<std::filesystem::path> KnownFiles(const IFileLocations& locations, EFileType type);

/// Copies a file to the user's folder of that type, which is made if need be, and logs it. `FileNotFound` and
/// `InvalidType` for what is not a file, `NotAvailable` where nothing is kept, `AlreadyPresent` when the folder has a
/// file of that name, `FileIOFailure`: `reason` says what.
NMX::IResult CopyToUserFolder(const IFileLocations& locations, const std::filesystem::path& file, EFileType type,
                              std::string& reason);

}
