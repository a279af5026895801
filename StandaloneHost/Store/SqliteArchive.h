#pragma once

#include "StandaloneHost/Store/FaultReport.h"
#include "StandaloneHost/Store/IArchive.h"
#include "StandaloneHost/Store/SqliteDatabase.h"
#include "StandaloneHost/Store/WatchedFile.h"

#include <filesystem>
#include <memory>
#include <string>

namespace Store
{

/// Keeps the store in one SQLite database file. While it is open no other process can open it. A commit that was kept
/// survives a kill of the process; the database survives a loss of power.
///
/// When the disk is full, the file is gone or the like, commits are refused, and the next one tries again: with the
/// connection there is, then with a new one, and with a new file once the old one is gone. A file that somebody else
/// has put in its place is not touched.
class SqliteArchive final : public IArchive
{
public:
  /// Opens or makes the database. Throws ArchiveError for a file that is locked, damaged, of another program or of a
  /// later version; such a file is left as it is.
  explicit SqliteArchive(const std::filesystem::path& file);
  ~SqliteArchive() override;

  [[nodiscard]] ChangeSet Load() override;
  NMX::IResult Keep(const ChangeSet& changes, const StoreState& content) override;
  void End(const StoreState& content) noexcept override;
  [[nodiscard]] std::string Fault() const override { return m_fault.Text(); }

private:
  /// Whether the files are where they were. Throws DatabaseError when what is there must not be touched.
  enum class EFiles
  {
    Present,
    Gone
  };
  [[nodiscard]] EFiles Look() const;
  void CheckFolder() const;

  bool Attempt(const ChangeSet& changes, const StoreState& content);
  void Open();
  void Drop();
  void OpenAgain(const StoreState& content);
  void MakeAnew(const StoreState& content);

  const std::string m_writer; // this archive, in what it writes
  std::string m_firstWriter;  // whoever wrote before it
  WatchedFile m_file, m_log;
  FaultReport m_fault;
  std::unique_ptr<SqliteDatabase> m_database; // none when it could not be opened again
};

}
