#include "StandaloneHost/Store/SqliteDatabase.h"

#include "StandaloneHost/Store/RecordText.h"
#include "StandaloneHost/Store/WriteObstacle.h"

#include <sqlite3.h>

#include <algorithm>
#include <cerrno>
#include <system_error>
#include <utility>
#include <vector>

namespace Store
{

using NMX::EResult;

namespace
{

constexpr int applicationId = 0x53554253; // "SUBS"
constexpr int schemaVersion = 2;          // 1 had numbers with a fraction as numbers; they are read as they are

void BindText(sqlite3_stmt* statement, int place, std::string_view text)
{
  sqlite3_bind_text64(statement, place, text.data(), text.size(), SQLITE_TRANSIENT, SQLITE_UTF8);
}

void BindId(sqlite3_stmt* statement, int place, NMX::TSubjectStoreId id)
{
  sqlite3_bind_int64(statement, place, static_cast<sqlite3_int64>(id.Value()));
}

std::string_view Text(sqlite3_stmt* statement, int column)
{
  const auto* text = reinterpret_cast<const char*>(sqlite3_column_text(statement, column));
  return text != nullptr ? std::string_view(text, static_cast<std::size_t>(sqlite3_column_bytes(statement, column)))
                         : std::string_view{};
}

}

void SqliteDatabase::Close::operator()(sqlite3* database) const
{
  sqlite3_close_v2(database);
}

void SqliteDatabase::Finalise::operator()(sqlite3_stmt* statement) const
{
  sqlite3_finalize(statement);
}

/// The error of the operating system that made the latest call fail, as far as that is known; 0 for none.
int SqliteDatabase::SystemError() const
{
  const int code = m_database ? sqlite3_errcode(m_database.get()) : SQLITE_OK;
  if (code != SQLITE_IOERR && code != SQLITE_CANTOPEN)
    return 0;
  // SQLite does not remember it of a commit.
  const int error = sqlite3_system_errno(m_database.get());
  return error != 0 ? error : m_error;
}

/// Why the latest call failed.
std::string SqliteDatabase::Reason() const
{
  sqlite3* const database = m_database.get();
  const int code = database != nullptr ? sqlite3_errcode(database) : SQLITE_NOMEM;
  const std::string message = database != nullptr ? sqlite3_errmsg(database) : sqlite3_errstr(code);
  if (code == SQLITE_BUSY || code == SQLITE_LOCKED)
    return "another process has it open";
  if (code == SQLITE_NOTADB || code == SQLITE_CORRUPT)
    return "the file is damaged, or not a store (" + message + ')';
  if (code == SQLITE_FULL)
    return "the disk is full";
  // SQLite tries other ways to open a file before it gives up, and tells what the last of them came to.
  if (code == SQLITE_READONLY || code == SQLITE_CANTOPEN || code == SQLITE_IOERR)
    if (std::string obstacle = WriteObstacle(m_file); !obstacle.empty())
      return obstacle;
  if (const int error = SystemError(); error != 0)
    return message + " (" + std::generic_category().message(error) + ')';
  return message;
}

void SqliteDatabase::Fail(const std::string& what) const
{
  const int code = m_database ? sqlite3_errcode(m_database.get()) : SQLITE_NOMEM;
  const bool full = code == SQLITE_FULL || SystemError() == EDQUOT;
  const EResult result = full ? EResult::DiskFull : EResult::FileIOFailure;
  if (code == SQLITE_OK || code == SQLITE_DONE || code == SQLITE_ROW)
    throw DatabaseError(what, result);
  if (code == SQLITE_NOTADB || code == SQLITE_CORRUPT)
    throw DatabaseError(Reason() + "; it was left as it is", result);
  throw DatabaseError(Reason(), result);
}

SqliteDatabase::SqliteDatabase(const std::filesystem::path& file, std::string writer)
    : SqliteDatabase(file, std::move(writer), EJournal::Log)
{
}

SqliteDatabase::SqliteDatabase(const std::filesystem::path& file, std::string writer, EJournal journal)
    : m_file(file), m_writer(std::move(writer))
{
  sqlite3* database = nullptr;
  const int opened = sqlite3_open_v2(file.c_str(), &database,
                                     SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_NOMUTEX, nullptr);
  m_database.reset(database);
  if (opened != SQLITE_OK)
    Fail("cannot open the file");
  sqlite3_extended_result_codes(database, 0);

  // The lock is taken by the first access and held until the database is closed.
  Execute("PRAGMA locking_mode = EXCLUSIVE");
  const int version = UserVersion();
  const bool log = journal == EJournal::Log;
  if (TextOf(log ? "PRAGMA journal_mode = WAL" : "PRAGMA journal_mode = OFF") != (log ? "wal" : "off"))
    Fail("it cannot be written with a write-ahead log");
  Execute(log ? "PRAGMA synchronous = NORMAL" : "PRAGMA synchronous = FULL");
  Execute("BEGIN EXCLUSIVE");
  if (version == 0)
    PrepareSchema();
  if (version < schemaVersion)
    Execute(("PRAGMA user_version = " + std::to_string(schemaVersion)).c_str());
  ReadLastWriter();
  Execute("COMMIT");
  PrepareStatements();
}

SqliteDatabase::~SqliteDatabase() = default;

void SqliteDatabase::Make(const std::filesystem::path& file, const std::string& writer, const StoreState& content)
{
  SqliteDatabase(file, writer, EJournal::None).WriteAll(content);
}

void SqliteDatabase::LeaveFilesAlone()
{
  sqlite3_db_config(m_database.get(), SQLITE_DBCONFIG_NO_CKPT_ON_CLOSE, 1, nullptr);
}

int SqliteDatabase::UserVersion()
{
  const int application = Number("PRAGMA application_id");
  const int version = Number("PRAGMA user_version");
  const int tables = Number("SELECT count(*) FROM sqlite_schema");
  if (application != applicationId && (application != 0 || version != 0 || tables != 0))
    throw DatabaseError("the database belongs to another program; it was left as it is");
  if (version > schemaVersion)
    throw DatabaseError("it was written by a later version (format " + std::to_string(version) +
                        ", this program knows " + std::to_string(schemaVersion) + "); it was left as it is");
  return version;
}

void SqliteDatabase::PrepareSchema()
{
  Execute("CREATE TABLE subject(id INTEGER PRIMARY KEY, kind TEXT NOT NULL, name TEXT NOT NULL, "
          "entries TEXT NOT NULL)");
  Execute("CREATE TABLE application(path TEXT PRIMARY KEY, value TEXT NOT NULL) WITHOUT ROWID");
  Execute("CREATE TABLE counter(nextSubjectId INTEGER NOT NULL)");
  Execute("INSERT INTO counter VALUES(1)");
  Execute(("PRAGMA application_id = " + std::to_string(applicationId)).c_str());
}

void SqliteDatabase::ReadLastWriter()
{
  if (Number("SELECT count(*) FROM sqlite_schema WHERE name = 'writer'") != 0)
    m_lastWriter = TextOf("SELECT max(text) FROM writer");
  m_writerKnown = m_lastWriter == m_writer;
}

void SqliteDatabase::PrepareStatements()
{
  m_begin = Prepare("BEGIN");
  m_commit = Prepare("COMMIT");
  m_rollback = Prepare("ROLLBACK");
  m_putSubject = Prepare("INSERT INTO subject(id, kind, name, entries) VALUES(?1, ?2, ?3, ?4) "
                         "ON CONFLICT(id) DO UPDATE SET name = ?3, entries = ?4");
  m_dropSubject = Prepare("DELETE FROM subject WHERE id = ?1");
  m_putApplication = Prepare("INSERT INTO application(path, value) VALUES(?1, ?2) "
                             "ON CONFLICT(path) DO UPDATE SET value = ?2");
  m_dropApplication = Prepare("DELETE FROM application WHERE path = ?1");
  m_putNextId = Prepare("UPDATE counter SET nextSubjectId = ?1");
}

SqliteDatabase::Statement SqliteDatabase::Prepare(const char* text)
{
  sqlite3_stmt* statement = nullptr;
  if (sqlite3_prepare_v3(m_database.get(), text, -1, SQLITE_PREPARE_PERSISTENT, &statement, nullptr) != SQLITE_OK)
    Fail("cannot use the file");
  return Statement(statement);
}

void SqliteDatabase::Execute(const char* text)
{
  if (sqlite3_exec(m_database.get(), text, nullptr, nullptr, nullptr) != SQLITE_OK)
    Fail("cannot use the file");
}

int SqliteDatabase::Number(const char* text)
{
  const Statement statement = Prepare(text);
  if (sqlite3_step(statement.get()) != SQLITE_ROW)
    Fail("cannot read the file");
  return sqlite3_column_int(statement.get(), 0);
}

std::string SqliteDatabase::TextOf(const char* text)
{
  const Statement statement = Prepare(text);
  if (sqlite3_step(statement.get()) != SQLITE_ROW)
    Fail("cannot read the file");
  return std::string(Text(statement.get(), 0));
}

void SqliteDatabase::CheckPages()
{
  std::string report = TextOf("PRAGMA quick_check(1)");
  std::replace(report.begin(), report.end(), '\n', ' ');
  if (report != "ok")
    throw DatabaseError("the file is damaged (" + report + "); it was left as it is");
}

void SqliteDatabase::LoadSubjects(ChangeSet& content, std::string& where)
{
  const Statement subjects = Prepare("SELECT id, kind, name, entries FROM subject ORDER BY id");
  int step = SQLITE_ROW;
  while ((step = sqlite3_step(subjects.get())) == SQLITE_ROW)
  {
    const NMX::TSubjectStoreId id(static_cast<std::uint64_t>(sqlite3_column_int64(subjects.get(), 0)));
    where = "subject " + std::to_string(id.Value());
    const auto kind = NMX::KindFromKey(Text(subjects.get(), 1));
    if (!kind)
      throw std::runtime_error("unknown kind \"" + std::string(Text(subjects.get(), 1)) + '"');
    auto record = RecordFromText(id, *kind, std::string(Text(subjects.get(), 2)), Text(subjects.get(), 3));
    content.subjects.emplace(id, ChangedSubject{std::move(record), *kind, 0x1F});
  }
  if (step != SQLITE_DONE)
    Fail("cannot read the file");

  // Parents stand in the children's entries only.
  for (auto& [id, subject] : content.subjects)
  {
    const NMX::TSubjectStoreId parent = subject.record->Parent();
    const auto found = content.subjects.find(parent);
    if (found != content.subjects.end())
      std::get<std::vector<NMX::TSubjectStoreId>>(found->second.record->values[CommonValue::children]).push_back(id);
    else if (parent.Valid())
      throw std::runtime_error("subject " + std::to_string(id.Value()) + " has no parent " +
                               std::to_string(parent.Value()));
  }
}

void SqliteDatabase::LoadApplication(ChangeSet& content, std::string& where)
{
  const Statement application = Prepare("SELECT path, value FROM application");
  int step = SQLITE_ROW;
  while ((step = sqlite3_step(application.get())) == SQLITE_ROW)
  {
    where = "entry \"" + std::string(Text(application.get(), 0)) + '"';
    content.applicationEntries.emplace(NMX::EntryPath(Text(application.get(), 0)),
                                       ValueFromText(Text(application.get(), 1)));
  }
  if (step != SQLITE_DONE)
    Fail("cannot read the file");
}

ChangeSet SqliteDatabase::Load()
{
  CheckPages();
  ChangeSet content;
  std::string where;
  try
  {
    LoadSubjects(content, where);
    LoadApplication(content, where);
  }
  catch (const DatabaseError&)
  {
    throw;
  }
  catch (const std::exception& failure)
  {
    throw DatabaseError(where + " cannot be read: " + failure.what() + "; the file was left as it is");
  }
  const Statement counter = Prepare("SELECT nextSubjectId FROM counter");
  if (sqlite3_step(counter.get()) != SQLITE_ROW)
    Fail("cannot read the file");
  content.nextId = NMX::TSubjectStoreId(static_cast<std::uint64_t>(sqlite3_column_int64(counter.get(), 0)));
  if (!content.subjects.empty() && content.nextId <= content.subjects.rbegin()->first)
    throw DatabaseError("its id counter is behind its subjects");
  return content;
}

/// Runs the body as one transaction; what stayed open would refuse every later one.
template <class Body>
void SqliteDatabase::Transaction(Body body)
{
  try
  {
    Step(m_begin.get());
    body();
    if (!m_writerKnown)
      PutWriter();
    Step(m_commit.get());
    m_writerKnown = true;
  }
  catch (...)
  {
    RollBack();
    throw;
  }
}

void SqliteDatabase::Write(const ChangeSet& changes)
{
  Transaction(
      [&]
      {
        for (const auto& [id, change] : changes.subjects)
        {
          if (change.record != nullptr)
          {
            PutSubject(*change.record);
            continue;
          }
          BindId(m_dropSubject.get(), 1, id);
          Step(m_dropSubject.get());
        }
        for (const auto& [path, value] : changes.applicationEntries)
          PutApplication(path, value);
        PutNextId(changes.nextId);
      });
}

void SqliteDatabase::WriteAll(const StoreState& content)
{
  Transaction(
      [&]
      {
        Execute("DELETE FROM subject");
        Execute("DELETE FROM application");
        for (const NMX::ESubjectKind kind : NMX::allSubjectKinds)
          for (const NMX::TSubjectStoreId id : content.Subjects(kind))
            PutSubject(*content.Find(id));
        for (const auto& [path, value] : content.ApplicationEntries())
          PutApplication(path, value);
        PutNextId(content.NextId());
      });
}

void SqliteDatabase::PutSubject(const SubjectRecord& record)
{
  BindId(m_putSubject.get(), 1, record.id);
  BindText(m_putSubject.get(), 2, NMX::KindKey(record.kind));
  BindText(m_putSubject.get(), 3, record.Name());
  BindText(m_putSubject.get(), 4, RecordToText(record));
  Step(m_putSubject.get());
}

void SqliteDatabase::PutApplication(NMX::EntryPath path, const NMX::Value& value)
{
  const bool removed = std::holds_alternative<std::monostate>(value);
  sqlite3_stmt* statement = removed ? m_dropApplication.get() : m_putApplication.get();
  BindText(statement, 1, path.Text());
  if (!removed)
    BindText(statement, 2, ValueToText(value));
  Step(statement);
}

void SqliteDatabase::PutWriter()
{
  Execute("CREATE TABLE IF NOT EXISTS writer(text TEXT NOT NULL)");
  Execute("DELETE FROM writer");
  const Statement put = Prepare("INSERT INTO writer VALUES(?1)");
  BindText(put.get(), 1, m_writer);
  Step(put.get());
}

void SqliteDatabase::PutNextId(NMX::TSubjectStoreId id)
{
  BindId(m_putNextId.get(), 1, id);
  Step(m_putNextId.get());
}

void SqliteDatabase::Step(sqlite3_stmt* statement)
{
  errno = 0;
  const int stepped = sqlite3_step(statement);
  m_error = errno;
  if (sqlite3_reset(statement) != SQLITE_OK || (stepped != SQLITE_DONE && stepped != SQLITE_ROW))
    Fail("cannot write the file");
}

void SqliteDatabase::RollBack() noexcept
{
  if (sqlite3_get_autocommit(m_database.get()) != 0)
    return;
  (void)sqlite3_step(m_rollback.get());
  sqlite3_reset(m_rollback.get());
}

}
