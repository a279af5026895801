#include "SubjectStoreUI/FileTypes.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StoreInterface/WideText.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <map>
#include <system_error>

namespace SubjectStoreUI::FileTypes
{

using NMX::EResult;
using NMX::IResult;

namespace
{

struct FileType
{
  std::uint32_t location;
  const char* extension; ///< empty: any
};

/// At the index of the type.
constexpr FileType types[] = {
    {IFileLocations::subjectTemplates, ".lbt"},
    {IFileLocations::smartObjectTemplates, ".sot"},
    {IFileLocations::characterTemplates, ".cct"},
    {IFileLocations::retargets, ""},
    {IFileLocations::markerlessTemplates, ""},
    {IFileLocations::retargetSkins, ".skin"},
    {IFileLocations::subjectSkins, ".skin"},
    {IFileLocations::propSkins, ".skin"},
    {IFileLocations::characterSkins, ".skin"},
    {IFileLocations::subjectConfigurations, ".xml"},
    {IFileLocations::subjects, ".xml"},
    {IFileLocations::props, ".xml"},
    {IFileLocations::labellingClusters, ".xml"},
    {IFileLocations::objects, ".xml"},
    {IFileLocations::exports, ""},
};

static_assert(std::size(types) == EFileType::EExportFile + 1);

const FileType* Find(EFileType type)
{
  const auto index = static_cast<std::size_t>(type); // what comes from QML may be any number
  return index < std::size(types) ? &types[index] : nullptr;
}

/// Of a wide text that is UTF-8 in the file system.
std::filesystem::path ToPath(const std::wstring& text)
{
  return NMX::ToUtf8(text).value_or(std::string{});
}

/// More than anybody would choose from.
constexpr std::size_t maximumFiles = 1000;

EResult ResultOf(const std::error_code& error)
{
  if (error == std::errc::file_exists)
    return EResult::AlreadyPresent;
  return error == std::errc::no_space_on_device ? EResult::DiskFull : EResult::FileIOFailure;
}

/// Copies to a place where nothing is, all of it or nothing.
std::error_code CopyWhole(const std::filesystem::path& file, const std::filesystem::path& target)
{
  const std::filesystem::path unfinished = target.parent_path() / (".unfinished-" + std::to_string(getpid()));
  std::error_code error, ignored;
  std::filesystem::copy_file(file, unfinished, std::filesystem::copy_options::overwrite_existing, error);
  if (!error && renameat2(AT_FDCWD, unfinished.c_str(), AT_FDCWD, target.c_str(), RENAME_NOREPLACE) != 0)
  {
    error.assign(errno, std::generic_category());
    if (errno == EINVAL) // to this file system
      std::filesystem::rename(unfinished, target, error);
  }
  if (error)
    std::filesystem::remove(unfinished, ignored);
  return error;
}

}

std::vector<std::filesystem::path> KnownFiles(const IFileLocations& locations, EFileType type)
{
  std::vector<std::filesystem::path> known;
  const FileType* fileType = Find(type);
  if (fileType == nullptr)
    return known;
  for (const std::wstring& folder : locations.Directories(fileType->location))
  {
    std::map<std::string, std::filesystem::path> files;
    std::error_code error;
    for (std::filesystem::directory_iterator next(ToPath(folder), error), end;
         !error && next != end && files.size() < maximumFiles; next.increment(error))
    {
      std::error_code unknown;
      const std::filesystem::path& file = next->path();
      const bool fits = *fileType->extension == '\0' || file.extension() == fileType->extension;
      if (fits && next->is_regular_file(unknown) && NMX::ToWide(file.string()))
        files.emplace(file.filename().string(), std::filesystem::absolute(file, unknown).lexically_normal());
    }
    std::erase_if(known, [&](const auto& file) { return files.contains(file.filename().string()); });
    for (auto& [name, file] : files)
      known.push_back(std::move(file));
  }
  return known;
}

IResult CopyToUserFolder(const IFileLocations& locations, const std::filesystem::path& file, EFileType type,
                         std::string& reason)
{
  const FileType* fileType = Find(type);
  if (fileType == nullptr)
    return EResult::InvalidType;
  const std::filesystem::path folder = ToPath(locations.UserDirectory(fileType->location));
  if (folder.empty())
  {
    reason = "There is no folder for files of one's own: the host keeps nothing.";
    return EResult::NotAvailable;
  }
  const std::filesystem::path target = folder / file.filename();
  const auto fail = [&](EResult result, const std::string& why) -> IResult
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Error, "Error copying %1% to %2% : %3%.", file.string(),
             target.string(), why);
    reason = "\"" + file.filename().string() + "\" cannot be copied: " + why + '.';
    return result;
  };
  std::error_code error;
  const auto status = std::filesystem::status(file, error);
  if (!std::filesystem::exists(status))
    return fail(EResult::FileNotFound, "there is no such file");
  if (!std::filesystem::is_regular_file(status))
    return fail(EResult::InvalidType, "it is not a file");
  std::filesystem::create_directory(folder, error);
  if (error)
    return fail(ResultOf(error), error.message());
  if (std::filesystem::exists(target, error))
    return fail(EResult::AlreadyPresent, "there is a file of that name already");
  if (const std::error_code failure = CopyWhole(file, target))
    return fail(ResultOf(failure), failure.message());
  NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Notice, "Copied %1% to %2%", file.string(), target.string());
  return EResult::Ok;
}

}
