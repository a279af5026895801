#include "StandaloneHost/Store/WatchedFile.h"

#include "StandaloneHost/Store/SqliteDatabase.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <system_error>

namespace Store
{

namespace
{

[[noreturn]] void FailWith(int error)
{
  throw DatabaseError("the file cannot be found: " + std::generic_category().message(error));
}

}

WatchedFile::~WatchedFile()
{
  if (m_descriptor >= 0)
    close(m_descriptor);
}

void WatchedFile::Watch()
{
  Watch(m_path);
}

void WatchedFile::Watch(const std::filesystem::path& present)
{
  // Closing an ordinary descriptor of a database would end its lock.
  const int descriptor = open(present.c_str(), O_PATH | O_CLOEXEC);
  if (descriptor < 0)
    FailWith(errno);
  struct stat known{};
  if (fstat(descriptor, &known) != 0)
  {
    const int error = errno;
    close(descriptor);
    FailWith(error);
  }
  if (m_descriptor >= 0)
    close(m_descriptor);
  m_descriptor = descriptor;
  m_device = known.st_dev;
  m_inode = known.st_ino;
}

void WatchedFile::TakeOver(WatchedFile& other) noexcept
{
  std::swap(m_descriptor, other.m_descriptor);
  m_device = other.m_device;
  m_inode = other.m_inode;
}

mode_t WatchedFile::Permissions() const
{
  struct stat known{};
  return m_descriptor >= 0 && fstat(m_descriptor, &known) == 0 ? known.st_mode & 0777 : 0644;
}

WatchedFile::EState WatchedFile::State() const
{
  struct stat found{};
  if (stat(m_path.c_str(), &found) != 0)
  {
    if (errno == ENOENT)
      return EState::Missing;
    FailWith(errno);
  }
  const bool same = m_descriptor >= 0 && found.st_dev == m_device && found.st_ino == m_inode;
  return same ? EState::Same : EState::Other;
}

}
