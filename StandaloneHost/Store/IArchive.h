#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StandaloneHost/Store/StoreState.h"

#include <stdexcept>
#include <string>

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
  /// `content` is all that was kept before, should it have to be written anew. `DiskFull`, or `FileIOFailure` with the
  /// reason in the log.
  virtual NMX::IResult Keep(const ChangeSet& changes, const StoreState& content) = 0;

  /// The last call: sees to it that the content is kept, as far as it can, and tells in the log what is not.
  virtual void End(const StoreState& /*content*/) noexcept {}

  /// Why commits cannot be kept at present, for people; empty when the latest could be kept. [any]
  [[nodiscard]] virtual std::string Fault() const { return {}; }
};

}
