#include "StandaloneHost/Files/WholeFile.h"

#include "StandaloneHost/Files/ConfigurationError.h"
#include "StandaloneHost/Store/WriteObstacle.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstdio>
#include <string>
#include <system_error>
#include <utility>

namespace Files
{

namespace fs = std::filesystem;
using NMX::EResult;

namespace
{

[[noreturn]] void FailWith(const fs::path& file, int error)
{
  const bool full = error == ENOSPC || error == EDQUOT;
  FailUnwritable(file, Store::WriteErrorText(file, error), full ? EResult::DiskFull : EResult::FileIOFailure);
}

/// Where the content belongs: a link stays, what it names is replaced.
fs::path Target(const fs::path& file)
{
  std::error_code error;
  const auto status = fs::status(file, error);
  if (status.type() == fs::file_type::not_found)
    return file;
  if (fs::is_directory(status))
    FailUnwritable(file, "this is a directory, expected a file", EResult::FileIOFailure);
  if (status.type() != fs::file_type::none && !fs::is_regular_file(status))
    FailUnwritable(file, "this is a device or a pipe, expected a file", EResult::FileIOFailure);
  // Only the folder's permission would be asked for otherwise.
  if (access(file.c_str(), W_OK) != 0)
    FailWith(file, errno);
  const fs::path target = fs::canonical(file, error);
  if (error)
    FailWith(file, error.value());
  return target;
}

/// The folder in which the file lies. If it had to be made, it goes again unless it is kept.
class Folder
{
public:
  explicit Folder(const fs::path& file) : m_path(file.has_parent_path() ? file.parent_path() : ".")
  {
    std::error_code ignored; // whoever writes there finds out
    m_made = fs::create_directory(m_path, ignored);
  }
  Folder(const Folder&) = delete;
  Folder& operator=(const Folder&) = delete;
  ~Folder()
  {
    if (m_made)
      rmdir(m_path.c_str());
  }

  [[nodiscard]] const fs::path& Path() const { return m_path; }

  /// Sees to it that the names in it outlive a loss of power, as far as it can.
  void Keep()
  {
    m_made = false;
    if (const int folder = open(m_path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC); folder >= 0)
    {
      (void)fsync(folder);
      close(folder);
    }
  }

private:
  const fs::path m_path;
  bool m_made = false;
};

/// A file under a name of its own, which goes again unless it is moved to where it belongs.
class UnfinishedFile
{
public:
  /// `file` is the one that errors tell of.
  UnfinishedFile(const fs::path& file, const fs::path& folder) : m_file(file)
  {
    static std::atomic<unsigned> count;
    do
    {
      m_path = folder / (".unfinished-" + std::to_string(getpid()) + '-' + std::to_string(++count));
      m_descriptor = open(m_path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    } while (m_descriptor < 0 && errno == EEXIST);
    if (m_descriptor < 0)
      FailWith(m_file, errno);
  }
  UnfinishedFile(const UnfinishedFile&) = delete;
  UnfinishedFile& operator=(const UnfinishedFile&) = delete;
  ~UnfinishedFile()
  {
    if (m_descriptor >= 0)
      close(m_descriptor);
    if (!m_moved)
      unlink(m_path.c_str());
  }

  [[nodiscard]] const fs::path& Path() const { return m_path; }

  void Write(std::string_view text)
  {
    while (!text.empty())
    {
      const ssize_t written = write(m_descriptor, text.data(), text.size());
      if (written < 0 && errno != EINTR)
        FailWith(m_file, errno);
      text.remove_prefix(static_cast<std::size_t>(written < 0 ? 0 : written));
    }
  }

  /// Puts it on the disk and in the place of `target`, whose permissions it takes over.
  void MoveTo(const fs::path& target)
  {
    struct stat known{};
    if (stat(target.c_str(), &known) == 0 && fchmod(m_descriptor, known.st_mode & 0777) != 0)
      FailWith(m_file, errno);
    if (fsync(m_descriptor) != 0)
      FailWith(m_file, errno);
    // Some disks tell only now that they are full.
    if (close(std::exchange(m_descriptor, -1)) != 0)
      FailWith(m_file, errno);
    if (std::rename(m_path.c_str(), target.c_str()) != 0)
      FailWith(m_file, errno);
    m_moved = true;
  }

private:
  const fs::path& m_file;
  fs::path m_path;
  int m_descriptor = -1;
  bool m_moved = false;
};

}

void WriteWholeFile(const fs::path& file, std::string_view text, const std::function<void(const fs::path&)>& check)
{
  const fs::path target = Target(file);
  Folder folder(target);
  UnfinishedFile unfinished(file, folder.Path());
  unfinished.Write(text);
  try
  {
    check(unfinished.Path());
  }
  catch (const ConfigurationError& failure)
  {
    // The place is one in a file that nobody will see.
    std::string problem = failure.what();
    if (const std::string begin = unfinished.Path().string() + ':'; problem.starts_with(begin))
      problem.erase(0, problem.find(": ", begin.size()) + 2);
    FailUnwritable(file, "it could not be read again: " + problem, failure.Result());
  }
  unfinished.MoveTo(target);
  folder.Keep();
}

}
