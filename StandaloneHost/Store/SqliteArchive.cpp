#include "StandaloneHost/Store/SqliteArchive.h"

#include "StandaloneHost/Store/WriteObstacle.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <random>
#include <system_error>
#include <utility>

namespace Store
{

namespace fs = std::filesystem;
using NMX::EResult;
using NMX::IResult;
using EState = WatchedFile::EState;

namespace
{

/// The log of a file that is named by a link lies beside the file, not beside the link.
fs::path Resolved(const fs::path& file)
{
  std::error_code error;
  const bool link = fs::is_symlink(file, error);
  const fs::path resolved = link ? fs::canonical(file, error) : fs::absolute(file, error);
  return error ? file : resolved;
}

fs::path WithSuffix(fs::path path, const char* suffix)
{
  path += suffix;
  return path;
}

fs::path Unfinished(const fs::path& file)
{
  return WithSuffix(file, ".unfinished");
}

std::string NewWriter()
{
  std::random_device random;
  return std::to_string(getpid()) + '-' + std::to_string(random()) + '-' + std::to_string(random());
}

[[noreturn]] void FailWith(const char* what, const fs::path& file, int error)
{
  const bool full = error == ENOSPC || error == EDQUOT;
  throw DatabaseError(std::string(what) + ": " + WriteErrorText(file, error),
                      full ? EResult::DiskFull : EResult::FileIOFailure);
}

/// Moves a file to a path, where there is either nothing or what may be replaced.
void Move(const fs::path& from, const fs::path& to, bool replace)
{
  if (!replace && renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0)
    return;
  const bool unknown = errno == EINVAL || errno == ENOSYS; // to this file system
  if ((replace || unknown) && std::rename(from.c_str(), to.c_str()) == 0)
    return;
  FailWith("the file cannot be written anew", to, errno);
}

/// Sees to it that the names in a folder outlive a loss of power, as far as it can.
void KeepNames(const fs::path& folder)
{
  if (const int descriptor = open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC); descriptor >= 0)
  {
    (void)fsync(descriptor);
    close(descriptor);
  }
}

/// A file that goes again, unless it was moved away.
struct UnfinishedFile
{
  /// An empty file.
  UnfinishedFile(fs::path file, mode_t permissions) : path(std::move(file))
  {
    Remove();
    const int descriptor = open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, permissions);
    if (descriptor < 0)
      FailWith("the file cannot be written anew", path, errno);
    close(descriptor);
  }
  UnfinishedFile(const UnfinishedFile&) = delete;
  UnfinishedFile& operator=(const UnfinishedFile&) = delete;
  ~UnfinishedFile() { Remove(); }
  void Remove() const { (void)unlink(path.c_str()); }

  const fs::path path;
};

}

SqliteArchive::SqliteArchive(const fs::path& file)
    : m_writer(NewWriter()), m_file(Resolved(file)), m_log(WithSuffix(m_file.Path(), "-wal")), m_fault(file.string())
{
  try
  {
    Open();
    m_file.Watch();
    m_firstWriter = m_database->LastWriter();
    (void)unlink(Unfinished(m_file.Path()).c_str());
  }
  catch (const DatabaseError& failure)
  {
    throw ArchiveError("cannot use the store \"" + file.string() + "\": " + failure.what());
  }
}

SqliteArchive::~SqliteArchive() = default;

ChangeSet SqliteArchive::Load()
{
  try
  {
    return m_database->Load();
  }
  catch (const DatabaseError& failure)
  {
    throw ArchiveError("cannot use the store \"" + m_file.Path().string() + "\": " + failure.what());
  }
}

IResult SqliteArchive::Keep(const ChangeSet& changes, const StoreState& content)
{
  if (m_fault.RefusesUntried())
    return m_fault.Result();
  const auto begin = std::chrono::steady_clock::now();
  try
  {
    m_fault.Succeeded(Attempt(changes, content));
  }
  catch (const DatabaseError& failure)
  {
    m_fault.Failed(failure, begin);
  }
  return m_fault.Result();
}

/// Answers whether the file had to be written anew.
bool SqliteArchive::Attempt(const ChangeSet& changes, const StoreState& content)
{
  const bool gone = Look() == EFiles::Gone;
  if (gone)
    MakeAnew(content);
  else if (!m_database)
    OpenAgain(content);
  else if (m_fault.Active())
  {
    try
    {
      m_database->Write(changes);
      return false;
    }
    catch (const DatabaseError& failure)
    {
      // It is not the disk alone: perhaps the connection is past use.
      if (failure.Result() == EResult::DiskFull)
        throw;
      OpenAgain(content);
    }
  }
  m_database->Write(changes);
  return gone;
}

SqliteArchive::EFiles SqliteArchive::Look() const
{
  const EState file = m_file.State();
  if (file == EState::Other)
    throw DatabaseError("another file has come in its place and is left alone. Move that file away, and the store is "
                        "written there anew; or end the host to use that file");
  const EState log = m_log.State();
  if (log == EState::Other && (m_database || file == EState::Missing))
    throw DatabaseError("the log of another database, \"" + m_log.Path().string() +
                        "\", lies beside it and is left alone. Move that away, and the store goes on");
  if (file == EState::Missing)
    CheckFolder();
  const bool gone = file == EState::Missing || (m_database && log == EState::Missing);
  return gone ? EFiles::Gone : EFiles::Present;
}

/// A folder is never made: it may be on a disk that is not there at the moment.
void SqliteArchive::CheckFolder() const
{
  std::error_code error;
  if (!fs::is_directory(m_file.Path().parent_path(), error))
    throw DatabaseError("its folder is gone. Put it back, or make an empty one, and the store is written there anew");
}

void SqliteArchive::Open()
{
  auto database = std::make_unique<SqliteDatabase>(m_file.Path(), m_writer);
  m_log.Watch();
  m_database = std::move(database);
}

void SqliteArchive::Drop()
{
  if (m_database)
    m_database->LeaveFilesAlone();
  m_database.reset();
}

void SqliteArchive::OpenAgain(const StoreState& content)
{
  Drop();
  Open();
  const std::string& last = m_database->LastWriter();
  const bool own = m_file.State() == EState::Same && (last == m_writer || last == m_firstWriter);
  if (!own)
  {
    Drop();
    throw DatabaseError(
        "another program has written to it meanwhile. Move the file away, and the store is written there "
        "anew; or end the host to use that file");
  }
  try
  {
    // A commit that was refused may have reached the log all the same.
    m_database->WriteAll(content);
  }
  catch (const DatabaseError&)
  {
    Drop();
    throw;
  }
}

/// Every moment before the new file is in its place, and all of it is there, the old one is as gone as it was.
void SqliteArchive::MakeAnew(const StoreState& content)
{
  const UnfinishedFile unfinished(Unfinished(m_file.Path()), m_file.Permissions());
  SqliteDatabase::Make(unfinished.path, m_writer, content);
  WatchedFile made(m_file.Path());
  made.Watch(unfinished.path);
  Drop();
  if (m_log.State() == EState::Same && unlink(m_log.Path().c_str()) != 0)
    FailWith("its log cannot be removed", m_log.Path(), errno);
  Move(unfinished.path, m_file.Path(), m_file.State() == EState::Same);
  m_file.TakeOver(made);
  KeepNames(m_file.Path().parent_path());
  Open();
}

void SqliteArchive::End(const StoreState& content) noexcept
{
  bool whole = false;
  try
  {
    whole = Look() == EFiles::Present && m_database;
    if (m_fault.Active() || !whole)
      m_fault.Succeeded(Attempt({{}, {}, content.NextId()}, content));
  }
  catch (const DatabaseError& failure)
  {
    m_fault.EndsWith(failure, whole, content.SubjectCount());
    if (!whole)
      Drop();
  }
  catch (...)
  {
    Drop();
  }
}

}
