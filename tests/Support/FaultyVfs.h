#pragma once

#include <sqlite3.h>

/// SQLite's way to the disk, by default for as long as this lives, through which operations on files can be made to
/// fail. One at a time.
class FaultyVfs
{
public:
  /// What happens to an operation whose turn it is.
  struct Fault
  {
    int code = SQLITE_OK; ///< what is answered in place of the operation
    bool torn = false;    ///< half of what is written is written all the same
    bool late = false;    ///< all of it is
  };

  FaultyVfs()
  {
    current = this;
    m_real = sqlite3_vfs_find(nullptr);
    m_vfs = *m_real;
    m_vfs.zName = "faulty";
    m_vfs.szOsFile = static_cast<int>(sizeof(File)) + m_real->szOsFile;
    m_vfs.xOpen = Open;
    m_vfs.xDelete = [](sqlite3_vfs*, const char* name, int)
    {
      const int failed = current->Count();
      return failed != SQLITE_OK ? failed : current->m_real->xDelete(current->m_real, name, 0);
    };
    sqlite3_vfs_register(&m_vfs, 1);
  }
  FaultyVfs(const FaultyVfs&) = delete;
  FaultyVfs& operator=(const FaultyVfs&) = delete;
  ~FaultyVfs()
  {
    sqlite3_vfs_unregister(&m_vfs);
    sqlite3_vfs_register(m_real, 1);
    current = nullptr;
  }

  /// Operations from the `first` (0 is the next) on fail, so many of them.
  void Fail(Fault fault, int first, int count = 1 << 30)
  {
    m_fault = fault;
    m_first = m_operations + first;
    m_last = m_first + count;
    m_failed = 0;
  }
  void Mend() { m_fault = {}; }

  /// While it is paused nothing fails, and nothing is counted.
  void Pause(bool paused) { m_paused = paused; }

  /// How many operations have failed since.
  [[nodiscard]] int Failed() const { return m_failed; }

private:
  struct File
  {
    sqlite3_file base;
    sqlite3_file* Real() { return reinterpret_cast<sqlite3_file*>(this + 1); }
  };

  static inline FaultyVfs* current = nullptr;

  static sqlite3_file* Real(sqlite3_file* file) { return reinterpret_cast<File*>(file)->Real(); }

  /// What an operation answers that may not be carried out; SQLITE_OK for one that may.
  int Count()
  {
    if (m_paused)
      return SQLITE_OK;
    const int number = m_operations++;
    if (m_fault.code == SQLITE_OK || number < m_first || number >= m_last)
      return SQLITE_OK;
    ++m_failed;
    return m_fault.code;
  }

  static int Open(sqlite3_vfs*, const char* name, sqlite3_file* file, int flags, int* outFlags)
  {
    file->pMethods = nullptr;
    if (const int failed = current->Count(); failed != SQLITE_OK)
      return SQLITE_CANTOPEN;
    sqlite3_file* const real = Real(file);
    const int opened = current->m_real->xOpen(current->m_real, name, real, flags, outFlags);
    if (real->pMethods != nullptr)
      file->pMethods = Methods();
    return opened;
  }

  static int Write(sqlite3_file* file, const void* bytes, int count, sqlite3_int64 offset)
  {
    const auto write = [&](int some) { return Real(file)->pMethods->xWrite(Real(file), bytes, some, offset); };
    const int failed = current->Count();
    if (failed == SQLITE_OK)
      return write(count);
    if (current->m_fault.torn || current->m_fault.late)
      (void)write(current->m_fault.late ? count : count / 2);
    return failed;
  }

  static const sqlite3_io_methods* Methods()
  {
    static const sqlite3_io_methods methods = []
    {
      sqlite3_io_methods made{};
      made.iVersion = 1;
      made.xClose = [](sqlite3_file* file) { return Real(file)->pMethods->xClose(Real(file)); };
      made.xRead = [](sqlite3_file* file, void* bytes, int count, sqlite3_int64 offset)
      { return Real(file)->pMethods->xRead(Real(file), bytes, count, offset); };
      made.xWrite = Write;
      made.xTruncate = [](sqlite3_file* file, sqlite3_int64 size)
      {
        const int failed = current->Count();
        return failed != SQLITE_OK ? failed : Real(file)->pMethods->xTruncate(Real(file), size);
      };
      made.xSync = [](sqlite3_file*, int) { return current->Count(); }; // no power is lost here
      made.xFileSize = [](sqlite3_file* file, sqlite3_int64* size)
      { return Real(file)->pMethods->xFileSize(Real(file), size); };
      made.xLock = [](sqlite3_file* file, int lock) { return Real(file)->pMethods->xLock(Real(file), lock); };
      made.xUnlock = [](sqlite3_file* file, int lock) { return Real(file)->pMethods->xUnlock(Real(file), lock); };
      made.xCheckReservedLock = [](sqlite3_file* file, int* held)
      { return Real(file)->pMethods->xCheckReservedLock(Real(file), held); };
      made.xFileControl = [](sqlite3_file* file, int operation, void* argument)
      { return Real(file)->pMethods->xFileControl(Real(file), operation, argument); };
      made.xSectorSize = [](sqlite3_file* file) { return Real(file)->pMethods->xSectorSize(Real(file)); };
      made.xDeviceCharacteristics = [](sqlite3_file* file)
      { return Real(file)->pMethods->xDeviceCharacteristics(Real(file)); };
      return made;
    }();
    return &methods;
  }

  sqlite3_vfs* m_real = nullptr;
  sqlite3_vfs m_vfs{};
  Fault m_fault;
  int m_operations = 0;
  int m_first = 0;
  int m_last = 0;
  int m_failed = 0;
  bool m_paused = false;
};
