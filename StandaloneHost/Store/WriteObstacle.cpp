#include "StandaloneHost/Store/WriteObstacle.h"

#include <fcntl.h>
#include <sys/statvfs.h>
#include <unistd.h>

#include <cerrno>
#include <optional>
#include <system_error>

namespace Store
{

namespace
{

namespace fs = std::filesystem;

constexpr const char* noMoreFiles = "the disk has room, but not for one more file (no inodes are left)";

fs::path FolderOf(const fs::path& file)
{
  return file.has_parent_path() ? file.parent_path() : fs::path(".");
}

std::optional<struct statvfs> DiskOf(const fs::path& file)
{
  struct statvfs disk{};
  if (statvfs(FolderOf(file).c_str(), &disk) != 0)
    return std::nullopt;
  return disk;
}

/// File systems that make inodes as they need them count none.
bool HasNoInodes(const struct statvfs& disk)
{
  return disk.f_files != 0 && disk.f_favail == 0;
}

bool May(const fs::path& path, int mode)
{
  return faccessat(AT_FDCWD, path.c_str(), mode, AT_EACCESS) == 0;
}

}

std::string WriteObstacle(const fs::path& file)
{
  const auto disk = DiskOf(file);
  if (disk && (disk->f_flag & ST_RDONLY) != 0)
    return "the file system is read-only";
  if (const bool present = May(file, F_OK); present && !May(file, W_OK))
    return "the file is read-only for this user";
  else if (present && !May(file, R_OK))
    return "this user may not read the file";
  if (disk && !May(FolderOf(file), W_OK | X_OK))
    return "its folder is read-only for this user";
  return disk && HasNoInodes(*disk) ? noMoreFiles : "";
}

std::string WriteErrorText(const fs::path& file, int error)
{
  if (error != ENOSPC)
    return std::generic_category().message(error);
  const auto disk = DiskOf(file);
  return disk && HasNoInodes(*disk) && disk->f_bavail != 0 ? noMoreFiles : "the disk is full";
}

}
