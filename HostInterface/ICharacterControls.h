#pragma once

#include "HostInterface/NMX/IResult.h"
#include "HostInterface/NMX/ITypedId.h"

#include <filesystem>
#include <memory>
#include <string>

namespace NMX
{
class IEntryEditor;
}

/// What a host has read of a template file, which only its own controls look into.
class ICharacterTemplate
{
public:
  ICharacterTemplate() = default;
  ICharacterTemplate(const ICharacterTemplate&) = delete;
  ICharacterTemplate& operator=(const ICharacterTemplate&) = delete;
  virtual ~ICharacterTemplate() = default;
};

/// Makes characters from template files and calibrates them. What an operation changes in the store it changes in the
/// edit access it is given, which its caller commits; where it fails, the caller lets go of the access. [any]
class ICharacterControls
{
public:
  ICharacterControls() = default;
  ICharacterControls(const ICharacterControls&) = delete;
  ICharacterControls& operator=(const ICharacterControls&) = delete;
  virtual ~ICharacterControls() = default;

  /// Makes a character with the slots and roles of a template that ReadTemplate has read. `InvalidName`,
  /// `AlreadyPresent`.
  virtual NMX::IResult CreateFromTemplate(NMX::IEntryEditor& access, const std::string& name,
                                          const ICharacterTemplate& content) = 0;

  /// Starts the calibration of a character, afresh if it runs already. The state ("Parameters/Calibration") is 1 at
  /// once and becomes 2 when the calibration is done.
  virtual NMX::IResult Calibrate(NMX::IEntryEditor& access, NMX::TSubjectStoreId character) = 0;

  /// Ends a calibration that runs and forgets what came of earlier ones: the state is 0.
  virtual NMX::IResult ClearCalibration(NMX::IEntryEditor& access, NMX::TSubjectStoreId character) = 0;

  /// Reads a template file, through NMX::LookAtFile, so no edit access is open meanwhile. `InvalidArgument` for an
  /// empty path, `FileNotFound` when nothing is there, `FileIOFailure` when it is not a file that can be read, or does
  /// not answer, `SerialisationFailure` when it cannot be read as a template: the log tells where and why.
  virtual NMX::IResult ReadTemplate(const std::filesystem::path& file,
                                    std::shared_ptr<const ICharacterTemplate>& content) const = 0;
};
