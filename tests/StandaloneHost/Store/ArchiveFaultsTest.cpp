#include "StandaloneHost/Store/SqliteArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "tests/Support/FaultyVfs.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/RandomStoreEdits.h"
#include "tests/Support/StoreDump.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <chrono>
#include <fstream>
#include <functional>
#include <iterator>
#include <thread>
#include <utility>

namespace fs = std::filesystem;
using NMX::EResult;
using NMX::IResult;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

namespace
{

std::shared_ptr<Store::VStore> Open(const fs::path& file)
{
  return NMX::MakeShared<Store::VStore>(std::make_unique<Store::SqliteArchive>(file));
}

std::string Bytes(const fs::path& file)
{
  std::ifstream in(file, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

/// A store in a folder of its own, and ways to disturb it.
class ArchiveFaultsTest : public testing::Test
{
protected:
  IResult Rename(const std::string& name) const
  {
    const auto editor = store->Editor();
    std::vector<NMX::TSubjectStoreId> ids;
    (void)editor->Subjects(NMX::ESubjectKind::Props, ids);
    NMX::TSubjectStoreId id;
    (void)(ids.empty() ? editor->Add(NMX::ESubjectKind::Props, name, id)
                       : editor->Rename(ids.front(), name, NMX::ENotify::Yes));
    return editor->Commit();
  }

  /// Edits until it is tried again.
  IResult RenameInTime(const std::string& name) const
  {
    IResult result = Rename(name);
    for (int i = 0; i < 3000 && result.Failed(); ++i)
    {
      std::this_thread::sleep_for(std::chrono::milliseconds(1));
      result = Rename(name);
    }
    return result;
  }

  /// What a host would find that starts after this one was killed now.
  [[nodiscard]] StoreDump Kept() const
  {
    const TemporaryFolder other;
    for (const char* name : {"store.sqlite", "store.sqlite-wal"})
      if (fs::exists(data / name))
        fs::copy_file(data / name, other.Path() / name);
    vfs.Pause(true);
    const StoreDump kept = Dump(*Open(other.Path() / "store.sqlite"));
    vfs.Pause(false);
    return kept;
  }

  [[nodiscard]] std::vector<std::string> Names() const
  {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(data))
      names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }

  /// Another store's file, in its whole.
  [[nodiscard]] fs::path MakeOther() const
  {
    const fs::path other = folder.Path() / "other.sqlite";
    (void)RandomStoreEdits(1).TryTransaction(*Open(other));
    return other;
  }

  mutable FaultyVfs vfs;
  const TemporaryFolder folder;
  const fs::path data = folder.Path() / "data";
  const fs::path file = data / "store.sqlite";
  const fs::path log = data / "store.sqlite-wal";
  const bool made = fs::create_directory(data);
  std::shared_ptr<Store::VStore> store = Open(file);
  LogCapture lines;
};

int CheckpointOften(sqlite3* database, char**, const void*)
{
  return sqlite3_wal_autocheckpoint(database, 12);
}

}

/// The proof: whichever operation on the disk fails, and however, memory and disk hold what was answered `Ok`.
class ArchiveFaultsEverywhereTest : public ArchiveFaultsTest
{
protected:
  void StartAfresh()
  {
    store.reset();
    fs::remove_all(data);
    fs::create_directory(data);
    store = Open(file);
  }

  /// Random edits, of which some are refused.
  void Edit(RandomStoreEdits& edits, const FaultyVfs::Fault& fault)
  {
    bool looked = false; // it takes its time, and is done at the first refusal and after the last of them in a row
    bool lookAgain = false;
    for (int i = 0; i < 20; ++i)
    {
      const StoreDump before = Dump(*store);
      const IResult result = edits.TryTransaction(*store);
      if (result.Failed())
      {
        ASSERT_EQ(result, IResult(fault.code == SQLITE_FULL ? EResult::DiskFull : EResult::FileIOFailure));
        ASSERT_TRUE(Dump(*store) == before);
        // What is written last makes it a commit: if that reaches the disk all the same, a kill would show it.
        if (!looked && !fault.late)
        {
          ASSERT_TRUE(Kept() == before);
        }
        ++refusals;
      }
      else if (lookAgain && !(Dump(*store) == before))
      {
        lookAgain = false;
        ASSERT_TRUE(Kept() == Dump(*store));
      }
      looked |= result.Failed();
      lookAgain |= result.Failed();
    }
  }

  void MendAndCompare()
  {
    vfs.Mend();
    ASSERT_EQ(RenameInTime("after all"), IResult(EResult::Ok));
    ASSERT_EQ(store->Fault(), "");
    const StoreDump held = Dump(*store);
    ASSERT_TRUE(Kept() == held);
    store.reset();
    ASSERT_THAT(Names(), ElementsAre("store.sqlite"));
    store = Open(file);
    ASSERT_TRUE(Dump(*store) == held);
  }

  int refusals = 0;
};

TEST_F(ArchiveFaultsEverywhereTest, NothingIsLostOrHalfDone)
{
  const auto often = reinterpret_cast<void (*)()>(CheckpointOften);
  sqlite3_auto_extension(often);
  constexpr int allOthers = 1 << 20;
  const FaultyVfs::Fault full{.code = SQLITE_FULL};
  const FaultyVfs::Fault readOnly{.code = SQLITE_READONLY};
  const FaultyVfs::Fault failed{.code = SQLITE_IOERR_WRITE};
  const FaultyVfs::Fault torn{.code = SQLITE_IOERR_WRITE, .torn = true};
  const FaultyVfs::Fault late{.code = SQLITE_IOERR_WRITE, .late = true};
  const std::pair<const FaultyVfs::Fault&, int> faults[] = {
      {full, 1}, {full, allOthers}, {readOnly, 7}, {torn, 1}, {failed, allOthers}, {late, 1}, {late, 7}};
  for (const auto& [fault, count] : faults)
  {
    int first = 0;
    for (bool reached = true; reached && !HasFailure(); ++first)
    {
      SCOPED_TRACE(testing::Message() << "fault " << fault.code << fault.torn << fault.late << ", " << count
                                      << " operations from the " << first << "th");
      StartAfresh();
      RandomStoreEdits edits(4711);
      for (int i = 0; i < 40; ++i)
        edits.Transaction(*store);
      vfs.Fail(fault, first, count);
      Edit(edits, fault);
      reached = vfs.Failed() != 0;
      MendAndCompare();
    }
    EXPECT_TRUE(first > 40 || HasFailure()) << "operations of a run, each of which has failed";
  }
  sqlite3_cancel_auto_extension(often);
  EXPECT_GT(refusals, 500);
}

TEST_F(ArchiveFaultsTest, FilesThatAreGoneAreWrittenAnew)
{
  const fs::path away = folder.Path() / "away";
  const std::function<void()> disturbances[] = {[&] { fs::remove(file); },
                                                [&] { fs::remove(log); },
                                                [&] { fs::rename(log, away); },
                                                [&] { fs::remove(file), fs::remove(log); },
                                                [&] { fs::rename(file, away); },
                                                [&] { fs::remove_all(data), fs::create_directory(data); },
                                                [&] { fs::rename(data, away), fs::create_directory(data); }};
  ASSERT_EQ(Rename("first"), IResult(EResult::Ok));
  for (const auto& disturb : disturbances)
  {
    const auto number = std::to_string(&disturb - disturbances);
    SCOPED_TRACE(number);
    disturb();
    lines.messages.clear();
    EXPECT_EQ(Rename("next " + number), IResult(EResult::Ok));
    EXPECT_TRUE(Kept() == Dump(*store));
    EXPECT_EQ(Rename("more " + number), IResult(EResult::Ok));
    EXPECT_TRUE(Kept() == Dump(*store));
    EXPECT_THAT(lines.messages, ElementsAre(AllOf(HasSubstr(file.string()), HasSubstr("written anew"))));
    EXPECT_THAT(Names(), ElementsAre("store.sqlite", "store.sqlite-wal"));
    fs::remove_all(away);
  }
}

TEST_F(ArchiveFaultsTest, AFolderThatIsGoneIsWaitedFor)
{
  const fs::path away = folder.Path() / "away";
  ASSERT_EQ(Rename("first"), IResult(EResult::Ok));
  const StoreDump before = Dump(*store);
  fs::rename(data, away);
  for (int i = 0; i < 100; ++i)
    EXPECT_EQ(Rename("second"), IResult(EResult::FileIOFailure));
  EXPECT_TRUE(Dump(*store) == before);
  EXPECT_FALSE(fs::exists(data)) << "it may be on a disk that is not there";
  EXPECT_THAT(store->Fault(), HasSubstr("its folder is gone"));
  fs::rename(away, data);
  EXPECT_EQ(RenameInTime("second"), IResult(EResult::Ok));
  EXPECT_TRUE(Kept() == Dump(*store));
  EXPECT_EQ(store->Fault(), "");
  EXPECT_THAT(lines.messages,
              ElementsAre(AllOf(HasSubstr("cannot keep changes: its folder is gone"), HasSubstr(file.string())),
                          HasSubstr("keeps changes again")));
}

TEST_F(ArchiveFaultsTest, WhatSomebodyElseHasPutThereIsLeftAlone)
{
  ASSERT_EQ(Rename("first"), IResult(EResult::Ok));
  const fs::path other = MakeOther();
  const std::string bytes = Bytes(other);
  const fs::path away = folder.Path() / "away";

  fs::rename(other, file);
  fs::remove(log);
  std::ofstream(log) << "of that other";
  EXPECT_EQ(Rename("second"), IResult(EResult::FileIOFailure));
  EXPECT_THAT(store->Fault(), HasSubstr("Move that file away"));
  EXPECT_EQ(Bytes(file), bytes);
  fs::rename(file, away);
  EXPECT_EQ(Rename("second"), IResult(EResult::FileIOFailure));
  fs::remove(log);
  EXPECT_EQ(RenameInTime("second"), IResult(EResult::Ok));
  EXPECT_TRUE(Kept() == Dump(*store));

  fs::rename(away, file);
  fs::remove(log);
  std::ofstream(log) << "of that other";
  const StoreDump held = Dump(*store);
  store.reset();
  EXPECT_EQ(Bytes(file), bytes) << "not at the end either";
  EXPECT_EQ(Bytes(log), "of that other");
  EXPECT_THAT(lines.messages.back(), AllOf(HasSubstr("1 subjects"), HasSubstr("Move that file away")));
}

/// The connection is given up when nothing else helps; somebody else may use the file then.
TEST_F(ArchiveFaultsTest, WhatAnotherProgramHasWrittenMeanwhileIsNotOverwritten)
{
  ASSERT_EQ(Rename("first"), IResult(EResult::Ok));
  vfs.Fail({SQLITE_IOERR_WRITE}, 0);
  EXPECT_EQ(Rename("second"), IResult(EResult::FileIOFailure));
  std::this_thread::sleep_for(std::chrono::milliseconds(100));
  EXPECT_EQ(Rename("second"), IResult(EResult::FileIOFailure));
  vfs.Mend();
  auto own = std::exchange(store, Open(file));
  ASSERT_EQ(Rename("of the other"), IResult(EResult::Ok));
  const StoreDump others = Dump(*store);
  store = own;
  std::this_thread::sleep_for(std::chrono::milliseconds(100));
  EXPECT_EQ(Rename("third"), IResult(EResult::FileIOFailure));
  EXPECT_THAT(store->Fault(), HasSubstr("another program has written to it"));
  EXPECT_TRUE(Kept() == others);
  fs::rename(file, folder.Path() / "away");
  fs::remove(log);
  EXPECT_EQ(RenameInTime("third"), IResult(EResult::Ok));
  EXPECT_TRUE(Kept() == Dump(*store));
}

TEST_F(ArchiveFaultsTest, TellsOfAFaultOnceAndTriesWithMeasure)
{
  vfs.Fail({SQLITE_FULL}, 0);
  const auto begin = std::chrono::steady_clock::now();
  int edits = 0;
  for (; std::chrono::steady_clock::now() - begin < std::chrono::milliseconds(300); ++edits)
    ASSERT_EQ(Rename("never"), IResult(EResult::DiskFull));
  EXPECT_LT(vfs.Failed(), edits / 2) << "of the edits";
  EXPECT_EQ(store->Fault(), "the disk is full");
  EXPECT_TRUE(store->Empty());
  vfs.Mend();
  EXPECT_EQ(RenameInTime("at last"), IResult(EResult::Ok));
  EXPECT_THAT(lines.messages,
              ElementsAre(AllOf(HasSubstr(file.string()), HasSubstr("the disk is full"), HasSubstr("refused")),
                          AllOf(HasSubstr("keeps changes again"), HasSubstr(" edits."))));
}

TEST_F(ArchiveFaultsTest, EndsWithAllThatItCanKeepAndTellsOfTheRest)
{
  ASSERT_EQ(Rename("first"), IResult(EResult::Ok));
  const StoreDump held = Dump(*store);
  fs::remove(file);
  store.reset();
  EXPECT_THAT(lines.messages, ElementsAre(HasSubstr("written anew"))) << "though nobody has edited since";
  EXPECT_THAT(Names(), ElementsAre("store.sqlite"));
  EXPECT_TRUE(Kept() == held);

  store = Open(file);
  vfs.Fail({SQLITE_FULL}, 0);
  EXPECT_EQ(Rename("second"), IResult(EResult::DiskFull));
  store.reset();
  EXPECT_THAT(lines.messages.back(), HasSubstr("All edits are in it but the 1 that were refused"));
  EXPECT_TRUE(Kept() == held);

  vfs.Mend();
  lines.messages.clear();
  store = Open(file);
  store.reset();
  EXPECT_THAT(lines.messages, IsEmpty());

  store = Open(file);
  fs::remove_all(data);
  store.reset();
  EXPECT_THAT(lines.messages,
              ElementsAre(AllOf(HasSubstr("the 1 subjects that it held"), HasSubstr("folder is gone"))));
  EXPECT_FALSE(fs::exists(data));
}
