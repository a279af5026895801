#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StandaloneHost/Store/StoreState.h"

#include <stdexcept>

namespace Store
{

/// An archive that cannot be opened or read; the text is for people and names the file.
class ArchiveError : public std::runtime_error
{
public:
  using std::runtime_error::runtime_error;
};

/// Where commits are kept.
class IArchive
{
public:
  virtual ~IArchive() = default;

  /// Everything that is kept, as the changes that make it from nothing. Throws ArchiveError.
  [[nodiscard]] virtual ChangeSet Load() = 0;

  /// Keeps a commit, all of it or nothing: what was kept survives the end of the process, however it ends.
  /// `DiskFull`, or `FileIOFailure` with the reason in the log.
  virtual NMX::IResult Keep(const ChangeSet& changes) = 0;
};

}
