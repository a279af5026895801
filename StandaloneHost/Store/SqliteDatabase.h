#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StandaloneHost/Store/StoreState.h"

#include <filesystem>
#include <memory>
#include <stdexcept>
#include <string>

struct sqlite3;
struct sqlite3_stmt;

namespace Store
{

/// Why a database cannot be used: for people, without the file's name, and as a result.
class DatabaseError : public std::runtime_error
{
public:
  explicit DatabaseError(const std::string& reason, NMX::IResult result = NMX::EResult::FileIOFailure)
      : std::runtime_error(reason), m_result(result)
  {
  }

  /// `DiskFull` or `FileIOFailure`.
  [[nodiscard]] NMX::IResult Result() const { return m_result; }

private:
  NMX::IResult m_result;
};

/// One connection to the database of a store (write-ahead log), which holds the file alone. All of it throws
/// DatabaseError, and a write that fails has changed nothing. Whoever has it guards it.
///
/// Tables: `subject` (id, kind, name, and the entries that differ from their initial value as JSON), `application`
/// (path and value), `counter` (the next subject id), `writer` (a text of whoever wrote last).
class SqliteDatabase
{
public:
  /// Opens or makes the database. One that is locked, damaged, of another program or of a later version is refused and
  /// left as it is. `writer` is put down with the first write.
  SqliteDatabase(const std::filesystem::path& file, std::string writer);
  ~SqliteDatabase();

  /// Makes a database at a path where nothing is, complete and on the disk. When it throws, what is there is not fit
  /// for use.
  static void Make(const std::filesystem::path& file, const std::string& writer, const StoreState& content);

  /// Who had written last when it was opened; empty when that is not known.
  [[nodiscard]] const std::string& LastWriter() const { return m_lastWriter; }

  [[nodiscard]] ChangeSet Load();
  void Write(const ChangeSet& changes);
  /// Replaces everything.
  void WriteAll(const StoreState& content);

  /// Closing it will leave all files alone, as those at its paths may belong to somebody else. What is in the log stays
  /// there.
  void LeaveFilesAlone();

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

  enum class EJournal
  {
    Log, ///< a write-ahead log
    None ///< a write that fails leaves the file unfit for use
  };

  SqliteDatabase(const std::filesystem::path& file, std::string writer, EJournal journal);

  [[nodiscard]] Statement Prepare(const char* text);
  void Execute(const char* text);
  [[nodiscard]] int Number(const char* text);
  [[nodiscard]] std::string TextOf(const char* text);
  [[nodiscard]] int UserVersion();
  void PrepareSchema();
  void ReadLastWriter();
  void PrepareStatements();
  void CheckPages();
  void LoadSubjects(ChangeSet& content, std::string& where);
  void LoadApplication(ChangeSet& content, std::string& where);

  template <class Body>
  void Transaction(Body body);
  void PutSubject(const SubjectRecord& record);
  void PutApplication(NMX::EntryPath path, const NMX::Value& value);
  void PutWriter();
  void PutNextId(NMX::TSubjectStoreId id);
  void Step(sqlite3_stmt* statement);
  void RollBack() noexcept;

  [[nodiscard]] int SystemError() const;
  [[nodiscard]] std::string Reason() const;
  [[noreturn]] void Fail(const std::string& what) const;

  const std::filesystem::path m_file;
  const std::string m_writer;
  std::string m_lastWriter;
  bool m_writerKnown = false; // the file says that m_writer wrote last
  int m_error = 0;            // errno after the latest step
  std::unique_ptr<sqlite3, Close> m_database;
  Statement m_begin, m_commit, m_rollback;
  Statement m_putSubject, m_dropSubject, m_putApplication, m_dropApplication, m_putNextId;
};

}
