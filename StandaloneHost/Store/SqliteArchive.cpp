#include "StandaloneHost/Store/SqliteArchive.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StandaloneHost/Store/RecordText.h"

#include <sqlite3.h>

#include <algorithm>
#include <utility>
#include <vector>

namespace Store
{

using NMX::EResult;
using NMX::IResult;

namespace
{

constexpr int applicationId = 0x53554253; // "SUBS"
constexpr int schemaVersion = 1;

/// A failed statement while a commit is being kept.
struct SqlFailure
{
  int code;
};

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

void SqliteArchive::Close::operator()(sqlite3* database) const
{
  sqlite3_close_v2(database);
}

void SqliteArchive::Finalise::operator()(sqlite3_stmt* statement) const
{
  sqlite3_finalize(statement);
}

void SqliteArchive::Fail(const std::string& what) const
{
  const int code = m_database ? sqlite3_errcode(m_database.get()) : SQLITE_NOMEM;
  std::string text = "cannot use the store \"" + m_file + "\": ";
  if (code == SQLITE_BUSY || code == SQLITE_LOCKED)
    text += "another process has it open";
  else if (code == SQLITE_NOTADB || code == SQLITE_CORRUPT)
    text += "the file is damaged, or not a store (" + std::string(sqlite3_errmsg(m_database.get())) +
            "); it was left as it is";
  else if (code == SQLITE_OK || code == SQLITE_DONE || code == SQLITE_ROW)
    text += what;
  else
    text += what + ": " + sqlite3_errmsg(m_database.get());
  throw ArchiveError(text);
}

SqliteArchive::SqliteArchive(const std::filesystem::path& file) : m_file(file.string())
{
  sqlite3* database = nullptr;
  const int opened = sqlite3_open_v2(m_file.c_str(), &database,
                                     SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_NOMUTEX, nullptr);
  m_database.reset(database);
  if (opened != SQLITE_OK)
    Fail("cannot open the file");
  sqlite3_extended_result_codes(database, 0);

  // The lock is taken by the first access and held until the database is closed.
  Execute("PRAGMA locking_mode = EXCLUSIVE");
  const int version = UserVersion();
  Execute("PRAGMA journal_mode = WAL");
  Execute("PRAGMA synchronous = NORMAL");
  Execute("BEGIN EXCLUSIVE");
  if (version == 0)
    PrepareSchema();
  Execute("COMMIT");

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

SqliteArchive::~SqliteArchive() = default;

int SqliteArchive::UserVersion()
{
  const auto number = [this](const char* pragma)
  {
    const Statement statement = Prepare(pragma);
    if (sqlite3_step(statement.get()) != SQLITE_ROW)
      Fail("cannot read the file");
    return sqlite3_column_int(statement.get(), 0);
  };
  const int application = number("PRAGMA application_id");
  const int version = number("PRAGMA user_version");
  const int tables = number("SELECT count(*) FROM sqlite_schema");
  if (application != applicationId && (application != 0 || version != 0 || tables != 0))
    Fail("the database belongs to another program; it was left as it is");
  if (version > schemaVersion)
    Fail("it was written by a later version (format " + std::to_string(version) + ", this program knows " +
         std::to_string(schemaVersion) + "); it was left as it is");
  return version;
}

void SqliteArchive::PrepareSchema()
{
  Execute("CREATE TABLE subject(id INTEGER PRIMARY KEY, kind TEXT NOT NULL, name TEXT NOT NULL, "
          "entries TEXT NOT NULL)");
  Execute("CREATE TABLE application(path TEXT PRIMARY KEY, value TEXT NOT NULL) WITHOUT ROWID");
  Execute("CREATE TABLE counter(nextSubjectId INTEGER NOT NULL)");
  Execute("INSERT INTO counter VALUES(1)");
  Execute(("PRAGMA application_id = " + std::to_string(applicationId)).c_str());
  Execute(("PRAGMA user_version = " + std::to_string(schemaVersion)).c_str());
}

SqliteArchive::Statement SqliteArchive::Prepare(const char* text)
{
  sqlite3_stmt* statement = nullptr;
  if (sqlite3_prepare_v3(m_database.get(), text, -1, SQLITE_PREPARE_PERSISTENT, &statement, nullptr) != SQLITE_OK)
    Fail("cannot use the file");
  return Statement(statement);
}

void SqliteArchive::Execute(const char* text)
{
  if (sqlite3_exec(m_database.get(), text, nullptr, nullptr, nullptr) != SQLITE_OK)
    Fail("cannot use the file");
}

ChangeSet SqliteArchive::Load()
{
  ChangeSet content;
  {
    const Statement check = Prepare("PRAGMA quick_check(1)");
    if (sqlite3_step(check.get()) != SQLITE_ROW)
      Fail("cannot read the file");
    if (Text(check.get(), 0) != "ok")
    {
      std::string report(Text(check.get(), 0));
      std::replace(report.begin(), report.end(), '\n', ' ');
      throw ArchiveError("cannot use the store \"" + m_file + "\": the file is damaged (" + report +
                         "); it was left as it is");
    }
  }

  std::string where;
  try
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

    const Statement application = Prepare("SELECT path, value FROM application");
    while ((step = sqlite3_step(application.get())) == SQLITE_ROW)
    {
      where = "entry \"" + std::string(Text(application.get(), 0)) + '"';
      content.applicationEntries.emplace(NMX::EntryPath(Text(application.get(), 0)),
                                         ValueFromText(Text(application.get(), 1)));
    }
    if (step != SQLITE_DONE)
      Fail("cannot read the file");
  }
  catch (const ArchiveError&)
  {
    throw;
  }
  catch (const std::exception& failure)
  {
    throw ArchiveError("cannot use the store \"" + m_file + "\": " + where + " cannot be read: " + failure.what() +
                       "; the file was left as it is");
  }

  const Statement counter = Prepare("SELECT nextSubjectId FROM counter");
  if (sqlite3_step(counter.get()) != SQLITE_ROW)
    Fail("cannot read the file");
  content.nextId = NMX::TSubjectStoreId(static_cast<std::uint64_t>(sqlite3_column_int64(counter.get(), 0)));
  if (!content.subjects.empty() && content.nextId <= content.subjects.rbegin()->first)
    throw ArchiveError("cannot use the store \"" + m_file + "\": its id counter is behind its subjects");
  return content;
}

void SqliteArchive::Step(sqlite3_stmt* statement)
{
  const int stepped = sqlite3_step(statement);
  sqlite3_reset(statement);
  if (stepped != SQLITE_DONE && stepped != SQLITE_ROW)
    throw SqlFailure{stepped};
}

IResult SqliteArchive::Keep(const ChangeSet& changes)
{
  try
  {
    Step(m_begin.get());
    for (const auto& [id, change] : changes.subjects)
    {
      if (change.record == nullptr)
      {
        BindId(m_dropSubject.get(), 1, id);
        Step(m_dropSubject.get());
        continue;
      }
      BindId(m_putSubject.get(), 1, id);
      BindText(m_putSubject.get(), 2, NMX::KindKey(change.kind));
      BindText(m_putSubject.get(), 3, change.record->Name());
      BindText(m_putSubject.get(), 4, RecordToText(*change.record));
      Step(m_putSubject.get());
    }
    for (const auto& [path, value] : changes.applicationEntries)
    {
      const bool removed = std::holds_alternative<std::monostate>(value);
      sqlite3_stmt* statement = removed ? m_dropApplication.get() : m_putApplication.get();
      BindText(statement, 1, path.Text());
      if (!removed)
        BindText(statement, 2, ValueToText(value));
      Step(statement);
    }
    BindId(m_putNextId.get(), 1, changes.nextId);
    Step(m_putNextId.get());
    Step(m_commit.get());
    return EResult::Ok;
  }
  catch (const SqlFailure& failure)
  {
    NMX::Log(NMX::systemLog, NMX::ESeverity::Error, "The store \"%1%\" cannot keep a change: %2%", m_file,
             sqlite3_errmsg(m_database.get()));
    RollBack();
    return failure.code == SQLITE_FULL ? EResult::DiskFull : EResult::FileIOFailure;
  }
  catch (...)
  {
    // A transaction that stayed open would refuse every later one.
    RollBack();
    throw;
  }
}

void SqliteArchive::RollBack() noexcept
{
  if (sqlite3_get_autocommit(m_database.get()) != 0)
    return;
  (void)sqlite3_step(m_rollback.get());
  sqlite3_reset(m_rollback.get());
}

}
