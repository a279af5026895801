#pragma once

#include "HostInterface/NMX/IResult.h"
#include "HostInterface/NMX/ITypedId.h"

#include <string>

/// Reads and writes the host's files of subjects. Each operation does all of it or nothing: a file that is written
/// appears whole or stays as it was, what is read is one edit of the store. `reason` is a sentence for people when it
/// fails, with the file, the line and what was expected where that is known, and is left alone otherwise.
///
/// `InvalidName` for an empty path, `FileNotFound` when there is nothing to read, `FileIOFailure` and `DiskFull` when a
/// file cannot be read or written, `SerialisationFailure` when the content is wrong, or the store holds what the format
/// cannot say, and the store's failures. The calling thread holds no access to the store. [any]
class IRunaCoreFileIO
{
public:
  IRunaCoreFileIO() = default;
  IRunaCoreFileIO(const IRunaCoreFileIO&) = delete;
  IRunaCoreFileIO& operator=(const IRunaCoreFileIO&) = delete;
  virtual ~IRunaCoreFileIO() = default;

  /// Puts what the file holds in the place of all subjects and object presets of the store; devices that are there
  /// stay as they are, and the others of the file are added.
  virtual NMX::IResult LoadSubjectConfiguration(const std::wstring& file, std::string& reason) = 0;

  /// Writes all subjects, devices and object presets.
  virtual NMX::IResult SaveSubjectConfiguration(const std::wstring& file, std::string& reason) = 0;

  /// Adds the subjects of a file that ExportSubject wrote. A subject whose name is in use is `AlreadyPresent`, unless
  /// `overwrite`: then the one that is there is removed first.
  virtual NMX::IResult ImportSubject(const std::wstring& file, bool overwrite, std::string& reason) = 0;

  /// Adds a mesh of the scene, named after the file. `NotSupported` when it is no mesh by its extension.
  virtual NMX::IResult ImportMesh(const std::wstring& file, std::string& reason) = 0;

  /// Writes the subject and everything beneath it. `InvalidId` when there is no such subject.
  virtual NMX::IResult ExportSubject(NMX::TSubjectStoreId subject, const std::wstring& file, std::string& reason) = 0;

  /// Writes a template from which such a subject can be made. `InvalidId` when there is no such subject, `NotSupported`
  /// for one that no template can describe.
  virtual NMX::IResult ExportTemplate(NMX::TSubjectStoreId subject, const std::wstring& file, std::string& reason) = 0;
};
