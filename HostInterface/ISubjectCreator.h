#pragma once

#include "HostInterface/NMX/IResult.h"

#include <string>

namespace NMX
{
class IEntryEditor;
}

/// Makes the subjects that calibrations begin with. [any]
class ISubjectCreator
{
public:
  ISubjectCreator() = default;
  ISubjectCreator(const ISubjectCreator&) = delete;
  ISubjectCreator& operator=(const ISubjectCreator&) = delete;
  virtual ~ISubjectCreator() = default;

  /// Adds a subject, and what the template has beneath it, in the given edit access, which the caller commits. Where it
  /// fails, the caller lets go of the access. The paths are those of files of the host; empty for none. Failures are
  /// the host's, those of a name `InvalidName` and `AlreadyPresent`.
  virtual NMX::IResult CreateSubject(NMX::IEntryEditor& access, const std::string& name,
                                     const std::wstring& labellingTemplate, const std::wstring& skin) = 0;
};
