// The file operations of VSubjectStoreQml.

#include "HostInterface/IRunaCoreFileIO.h"
#include "HostInterface/NMX/GlobalLog.h"
#include "SubjectStoreUI/FileTypes.h"
#include "SubjectStoreUI/PanelBackend.h"
#include "SubjectStoreUI/VSubjectStoreQml.h"

#include <optional>

namespace SubjectStoreUI
{

using NMX::EResult;
using NMX::IResult;
using RunaCorePluginInterface::IPanelServices;

namespace
{

/// The path of a local file; none for any other URL.
std::optional<QString> LocalPath(const QUrl& url)
{
  const QString path = url.isLocalFile() ? url.toLocalFile() : QString();
  return path.isEmpty() || path.contains(QChar(u'\0')) ? std::nullopt : std::optional(path);
}

/// What all operations on files have in common: `operate(fileIO, path, reason)`.
template <class Operate>
VResultGadget WithFile(const PanelBackend& backend, const QUrl& url, Operate operate)
{
  const auto path = LocalPath(url);
  if (!path)
    return {EResult::InvalidName, "\"" + url.toString().toStdString() + "\" is not a file on this machine."};
  const auto fileIO = backend.Get(&IPanelServices::FileIO);
  if (!fileIO)
    return IResult(EResult::NotAvailable);
  std::string reason;
  const IResult result = Subjects::Guarded([&] { return operate(*fileIO, path->toStdWString(), reason); });
  return {result, reason};
}

}

VResultGadget VSubjectStoreQml::loadSubjectConfiguration(const QUrl& i_FilePath)
{
  return WithFile(Backend(), i_FilePath, [](IRunaCoreFileIO& fileIO, const std::wstring& path, std::string& reason)
                  { return fileIO.LoadSubjectConfiguration(path, reason); });
}

VResultGadget VSubjectStoreQml::saveSubjectConfiguration(const QUrl& i_FilePath)
{
  return WithFile(Backend(), i_FilePath,
                  [](IRunaCoreFileIO& fileIO, const std::wstring& path, std::string& reason)
                  {
                    const IResult saved = fileIO.SaveSubjectConfiguration(path, reason);
                    if (saved.Failed())
                      NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "Unable to save subject configuration: %1%",
                               saved.Name());
                    return saved;
                  });
}

VResultGadget VSubjectStoreQml::importSubject(const QUrl& i_FilePath, bool i_bOverwrite)
{
  return WithFile(Backend(), i_FilePath,
                  [i_bOverwrite](IRunaCoreFileIO& fileIO, const std::wstring& path, std::string& reason)
                  { return fileIO.ImportSubject(path, i_bOverwrite, reason); });
}

VResultGadget VSubjectStoreQml::importMesh(const QUrl& i_FilePath)
{
  return WithFile(Backend(), i_FilePath, [](IRunaCoreFileIO& fileIO, const std::wstring& path, std::string& reason)
                  { return fileIO.ImportMesh(path, reason); });
}

VResultGadget VSubjectStoreQml::exportSubject(const VStoreIdGadget& i_SubjectStoreId, const QUrl& i_FilePath)
{
  return WithFile(Backend(), i_FilePath, [&](IRunaCoreFileIO& fileIO, const std::wstring& path, std::string& reason)
                  { return fileIO.ExportSubject(i_SubjectStoreId.Id(), path, reason); });
}

VResultGadget VSubjectStoreQml::exportTemplate(const VStoreIdGadget& i_SubjectStoreId, const QUrl& i_FilePath)
{
  return WithFile(Backend(), i_FilePath, [&](IRunaCoreFileIO& fileIO, const std::wstring& path, std::string& reason)
                  { return fileIO.ExportTemplate(i_SubjectStoreId.Id(), path, reason); });
}

QList<QUrl> VSubjectStoreQml::Paths(ESubjectFileType i_Type) const
{
  QList<QUrl> urls;
  if (const auto locations = Backend().Get(&IPanelServices::FileLocations))
    for (const auto& file : FileTypes::KnownFiles(*locations, i_Type))
      urls.append(QUrl::fromLocalFile(QString::fromStdString(file.string())));
  return urls;
}

VResultGadget VSubjectStoreQml::copyFileToUserFolder(const QUrl& i_FilePath, ESubjectFileType i_SubjectFileType)
{
  const auto path = LocalPath(i_FilePath);
  if (!path)
    return {EResult::InvalidName, "\"" + i_FilePath.toString().toStdString() + "\" is not a file on this machine."};
  const auto locations = Backend().Get(&IPanelServices::FileLocations);
  if (!locations)
    return IResult(EResult::NotAvailable);
  std::string reason;
  const IResult copied = Subjects::Guarded(
      [&] { return FileTypes::CopyToUserFolder(*locations, path->toStdString(), i_SubjectFileType, reason); });
  return {copied, reason};
}

}
