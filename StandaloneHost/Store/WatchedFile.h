#pragma once

#include <sys/types.h>

#include <filesystem>
#include <utility>

namespace Store
{

/// Tells whether the file that lay at a path is still the one that lies there. It is told by device and inode, and held
/// without being opened, so that no other file gets its inode. Whoever has it guards it.
class WatchedFile
{
public:
  enum class EState
  {
    Same,
    Missing,
    Other
  };

  /// No file: whatever lies at the path is another.
  explicit WatchedFile(std::filesystem::path path) : m_path(std::move(path)) {}
  WatchedFile(const WatchedFile&) = delete;
  WatchedFile& operator=(const WatchedFile&) = delete;
  ~WatchedFile();

  /// From now on it is the file that lies at the path, or at another one from which it is going to be moved there.
  /// Throws DatabaseError, and then it is the one that it was.
  void Watch();
  void Watch(const std::filesystem::path& present);
  /// From now on it is the file that `other` watches.
  void TakeOver(WatchedFile& other) noexcept;

  /// Throws DatabaseError when that cannot be told.
  [[nodiscard]] EState State() const;

  /// Those of the file that is watched; those of a new file when there is none.
  [[nodiscard]] mode_t Permissions() const;

  [[nodiscard]] const std::filesystem::path& Path() const { return m_path; }

private:
  const std::filesystem::path m_path;
  int m_descriptor = -1;
  dev_t m_device = 0;
  ino_t m_inode = 0;
};

}
