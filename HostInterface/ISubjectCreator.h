#pragma once

#include "HostInterface/NMX/IResult.h"

#include <memory>
#include <string>

namespace NMX
{
class IEntryEditor;
}

/// What a host has read of the files that a subject is made from, which only its own creator looks into.
class ISubjectTemplate
{
public:
  ISubjectTemplate() = default;
  ISubjectTemplate(const ISubjectTemplate&) = delete;
  ISubjectTemplate& operator=(const ISubjectTemplate&) = delete;
  virtual ~ISubjectTemplate() = default;
};

/// Makes the subjects that calibrations begin with. [any]
class ISubjectCreator
{
public:
  ISubjectCreator() = default;
  ISubjectCreator(const ISubjectCreator&) = delete;
  ISubjectCreator& operator=(const ISubjectCreator&) = delete;
  virtual ~ISubjectCreator() = default;

  /// Adds a subject, and what the template has beneath it, in the given edit access, which the caller commits. Where it
  /// fails, the caller lets go of the access. Failures are the host's, those of a name `InvalidName` and
  /// `AlreadyPresent`.
  virtual NMX::IResult CreateSubject(NMX::IEntryEditor& access, const std::string& name,
                                     const ISubjectTemplate& content) = 0;

  /// Reads the files that a subject is made from, through NMX::LookAtFile, so no edit access is open meanwhile. The
  /// paths are those of files of the host; empty for none. Failures are the host's; a file that does not answer is one
  /// that cannot be read.
  virtual NMX::IResult ReadTemplate(const std::wstring& labellingTemplate, const std::wstring& skin,
                                    std::shared_ptr<const ISubjectTemplate>& content) const = 0;
};
