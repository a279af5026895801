#pragma once

#include "StandaloneHost/Store/IArchive.h"

#include <filesystem>
#include <memory>
#include <string>

struct sqlite3;
struct sqlite3_stmt;

namespace Store
{

/// Keeps the store in one SQLite database file (write-ahead log). While it is open no other process can open it. A
/// commit that was kept survives a kill of the process; the database survives a loss of power.
///
/// Tables: `subject` (id, kind, name, and the entries that differ from their initial value as JSON), `application`
/// (path and value), `counter` (the next subject id).
class SqliteArchive final : public IArchive
{
public:
  /// Opens or makes the database. Throws ArchiveError for a file that is locked, damaged, of another program or of a
  /// later version; such a file is left as it is.
  explicit SqliteArchive(const std::filesystem::path& file);
  ~SqliteArchive() override;

  [[nodiscard]] ChangeSet Load() override;
  NMX::IResult Keep(const ChangeSet& changes) override;

private:
  struct Close
  {
    void operator()(sqlite3* database) const;
  };
  struct Finalise
  {
    void operator()(sqlite3_stmt* statement) const;
  };
  using Statement = std::unique_ptr<sqlite3_stmt, Finalise>;

  [[nodiscard]] Statement Prepare(const char* text);
  void Execute(const char* text);
  void PrepareSchema();
  [[nodiscard]] int UserVersion();
  void Step(sqlite3_stmt* statement);
  void RollBack() noexcept;
  [[noreturn]] void Fail(const std::string& what) const;

  std::string m_file;
  std::unique_ptr<sqlite3, Close> m_database;
  Statement m_begin, m_commit, m_rollback;
  Statement m_putSubject, m_dropSubject, m_putApplication, m_dropApplication, m_putNextId;
};

}
