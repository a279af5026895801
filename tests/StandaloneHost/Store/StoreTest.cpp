#include "StandaloneHost/Store/VStore.h"

#include "HostInterface/DebugServices/CallAssertFailHandler.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

#include <atomic>
#include <thread>

using NMX::EAspect;
using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using NMX::TSubjectStoreId;
using testing::ElementsAre;
namespace Paths = NMX::Paths;

namespace
{

class StoreTest : public StoreFixture
{
protected:
  NMX::ChangeStamps Stamps(TSubjectStoreId id)
  {
    NMX::ChangeStamps stamps{};
    EXPECT_TRUE(store->Reader()->Stamps(id, stamps).Succeeded());
    return stamps;
  }
};

}

TEST_F(StoreTest, EachKindHasItsEntriesAndNoOthers)
{
  const struct
  {
    ESubjectKind kind;
    std::uint32_t objectKind;
    std::vector<const char*> has;
    std::vector<const char*> lacks;
  } cases[] = {
      {ESubjectKind::BasicObjects,
       1,
       {"Parameters/AutoAssignedName", "Parameters/FilePath", "Roles/Labelling", "Markers"},
       {"SmartObject", "SmartObject/SmartClusters", "Parameters/Calibration", "Roles/Solving", "Slots"}},
      {ESubjectKind::SmartObjects,
       3,
       {"SmartObject", "SmartObject/SkinName", "SmartObject/AdditionalMarkerPositions", "Parameters/ColourRGBA"},
       {"Parameters/FilePath", "Roles/Labelling", "Markers"}},
      {ESubjectKind::CharactersFromClusters,
       0,
       {"Parameters/Calibration", "Parameters/Retarget", "ReloadRetargetAction", "Roles/Retargeting", "Slots"},
       {"Roles/Labelling", "Parameters/ColourRGBA"}},
      {ESubjectKind::GeneralSubjects,
       0,
       {"ModelOutputs/CGM2", "ModelOutputs/PluginKinex", "Roles/Labelling"},
       {"Slots"}},
      {ESubjectKind::LabellingClusters,
       0,
       {"Parameters/LinkedCameraURN", "Parameters/TrackWithObjectTracker", "Parameters/PresetName"},
       {"Parameters/AutoAssignedName"}},
      {ESubjectKind::Markerless, 0, {"Roles/Retargeting", "Parameters/Calibration"}, {"Roles/Solving"}},
      {ESubjectKind::Props, 0, {}, {"Parameters/ColourRGBA", "Roles/Labelling"}},
      {ESubjectKind::SceneMeshes, 0, {"Parameters/FilePath", "Roles/Labelling"}, {"Parameters/ColourRGBA"}},
  };
  for (const auto& c : cases)
  {
    const TSubjectStoreId id = Add(c.kind, NMX::KindKey(c.kind));
    const auto reader = store->Reader();
    std::uint32_t objectKind = 99;
    EXPECT_TRUE(reader->ObjectKind(id, objectKind).Succeeded());
    EXPECT_EQ(objectKind, c.objectKind) << c.kind;
    const auto exists = [&](const char* path)
    {
      const NMX::Value* value = nullptr;
      EXPECT_TRUE(reader->Find(id, NMX::EntryPath(path), value).Succeeded());
      return value != nullptr;
    };
    for (const char* path : {"SubjectId", "Parameters", "Parameters/Name", "Parameters/Enabled", "Parameters/Flags",
                             "ParentSubjectId", "ParentSubjectSlotId", "Children", "Roles", "Warnings",
                             "Warnings/WarningDuplicateDevice", "Warnings/WarningRadioConflict"})
      EXPECT_TRUE(exists(path)) << c.kind << ' ' << path;
    for (const char* path : c.has)
      EXPECT_TRUE(exists(path)) << c.kind << ' ' << path;
    for (const char* path : c.lacks)
      EXPECT_FALSE(exists(path)) << c.kind << ' ' << path;
    EXPECT_FALSE(exists("Parameters/Nonsense"));
  }
}

TEST_F(StoreTest, TypedReadsTellApartWhatIsMissingEmptyAndOfAnotherType)
{
  LogCapture log;
  const TSubjectStoreId id = Add(ESubjectKind::SmartObjects, "Glove");
  const auto reader = store->Reader();
  std::wstring wide = L"untouched";
  std::string text;
  bool flag = false;
  EXPECT_EQ(NMX::Read(*reader, id, Paths::FilePath(), wide), IResult(EResult::NotFound));
  EXPECT_EQ(NMX::Read(*reader, id, Paths::AutoAssignedName(), text), IResult(EResult::NotSet));
  EXPECT_EQ(NMX::Read(*reader, id, Paths::Parameters(), text), IResult(EResult::NotSet));
  EXPECT_EQ(NMX::Read(*reader, id, Paths::Name(), flag), IResult(EResult::InvalidType));
  EXPECT_EQ(NMX::Read(*reader, TSubjectStoreId(99), Paths::Name(), text), IResult(EResult::InvalidId));
  EXPECT_EQ(wide, L"untouched");
  EXPECT_THAT(log.messages, ElementsAre("Store entry 'Parameters/FilePath' does not exist.",
                                        "Store entry 'Parameters/AutoAssignedName' has no value.",
                                        "Store entry 'Parameters' has no value."));
}

TEST_F(StoreTest, WritesThatDoNotFitAreRefused)
{
  const TSubjectStoreId id = Add(ESubjectKind::BasicObjects, "Crate");
  const auto editor = store->Editor();
  EXPECT_EQ(editor->SetValue(id, Paths::SmartClusters(), std::vector<NMX::SmartCluster>{}), IResult(EResult::NotFound));
  EXPECT_EQ(editor->SetValue(id, Paths::Enabled(), 1), IResult(EResult::InvalidType));
  EXPECT_EQ(editor->SetValue(id, Paths::Enabled(), {}), IResult(EResult::InvalidType))
      << "a truth value cannot be empty";
  EXPECT_EQ(editor->SetValue(id, Paths::ParentSubjectId(), {}), IResult(EResult::InvalidType));
  EXPECT_EQ(editor->SetValue(id, Paths::Name(), std::string("x")), IResult(EResult::NotPermitted)) << "Rename does it";
  EXPECT_EQ(editor->SetValue(id, Paths::SubjectId(), TSubjectStoreId(5)), IResult(EResult::NotPermitted));
  EXPECT_EQ(editor->SetValue(id, Paths::Children(), std::vector<TSubjectStoreId>{}), IResult(EResult::NotPermitted));
  EXPECT_EQ(editor->SetValue(id, Paths::Parameters(), std::string("x")), IResult(EResult::NotPermitted));
  EXPECT_EQ(editor->SetValue(id, Paths::Flags(), 3U), IResult(EResult::InvalidValue)) << "a basic object is not smart";
  EXPECT_EQ(editor->SetValue(id, Paths::Flags(), 0x41U), IResult(EResult::Ok));
  EXPECT_EQ(editor->SetValue(TSubjectStoreId(99), Paths::Enabled(), false), IResult(EResult::InvalidId));
}

TEST_F(StoreTest, AnEditReadsItselfAndIsSeenByOthersAfterItsCommitOnly)
{
  const TSubjectStoreId crate = Add(ESubjectKind::BasicObjects, "Crate");
  const TSubjectStoreId sword = Add(ESubjectKind::BasicObjects, "Sword");
  {
    const auto editor = store->Editor();
    TSubjectStoreId shield;
    EXPECT_TRUE(editor->Remove(sword).Succeeded());
    EXPECT_TRUE(editor->Rename(crate, "Sword", NMX::ENotify::Yes).Succeeded()) << "the name has just become free";
    EXPECT_TRUE(editor->Add(ESubjectKind::BasicObjects, "Crate", shield).Succeeded());
    std::vector<TSubjectStoreId> ids;
    EXPECT_TRUE(editor->Subjects(ESubjectKind::BasicObjects, ids).Succeeded());
    EXPECT_THAT(ids, ElementsAre(crate, shield));
    TSubjectStoreId found;
    EXPECT_TRUE(editor->FindByName("Sword", found).Succeeded());
    EXPECT_EQ(found, crate);

    EXPECT_TRUE(store->Reader()->FindByName("Sword", found).Succeeded());
    EXPECT_EQ(found, sword);
  } // discarded
  EXPECT_EQ(Get<std::string>(crate, Paths::Name()), "Crate");
  EXPECT_EQ(Get<std::string>(sword, Paths::Name()), "Sword");

  const auto editor = store->Editor();
  EXPECT_TRUE(editor->Rename(crate, "Old crate", NMX::ENotify::Yes).Succeeded());
  EXPECT_TRUE(editor->Rename(sword, "Crate", NMX::ENotify::Yes).Succeeded());
  EXPECT_TRUE(editor->Rename(crate, "Sword", NMX::ENotify::Yes).Succeeded());
  EXPECT_TRUE(editor->Commit().Succeeded());
  EXPECT_EQ(editor->Commit(), IResult(EResult::NotAvailable));
  TSubjectStoreId found;
  EXPECT_TRUE(store->Reader()->FindByName("Sword", found).Succeeded());
  EXPECT_EQ(found, crate);
  EXPECT_EQ(store->Reader()->FindByName("Old crate", found), IResult(EResult::NotFound));
}

TEST_F(StoreTest, StampsAdvanceForWhatChangedAndForNothingElse)
{
  const TSubjectStoreId crate = Add(ESubjectKind::BasicObjects, "Crate");
  const TSubjectStoreId other = Add(ESubjectKind::BasicObjects, "Other");
  const struct
  {
    NMX::EntryPath path;
    NMX::Value value;
    EAspect aspect;
  } edits[] = {{Paths::Enabled(), false, EAspect::Parameters},
               {Paths::RoleLabelling(), false, EAspect::Parameters},
               {Paths::Markers(), std::vector<NMX::Position>{{1, 2, 3}}, EAspect::Markers},
               {NMX::EntryPath("Warnings/WarningObjectConfusion"), true, EAspect::Warnings}};
  for (const auto& edit : edits)
  {
    const NMX::ChangeStamps before = Stamps(crate);
    const NMX::ChangeStamps otherBefore = Stamps(other);
    const auto highest = std::max(*std::max_element(before.begin(), before.end()),
                                  *std::max_element(otherBefore.begin(), otherBefore.end()));
    Set(crate, edit.path, edit.value);
    const NMX::ChangeStamps after = Stamps(crate);
    for (std::size_t aspect = 0; aspect < after.size(); ++aspect)
    {
      if (aspect == static_cast<std::size_t>(edit.aspect))
        EXPECT_GT(after[aspect], highest) << edit.path;
      else
        EXPECT_EQ(after[aspect], before[aspect]) << edit.path;
    }
    EXPECT_EQ(Stamps(other), otherBefore);
    Set(crate, edit.path, edit.value); // no effect
    EXPECT_EQ(Stamps(crate), after) << edit.path;
  }
}

TEST_F(StoreTest, ParentsAndChildrenStayInStep)
{
  const TSubjectStoreId body = Add(ESubjectKind::GeneralSubjects, "Body");
  const TSubjectStoreId arm = Add(ESubjectKind::GeneralSubjects, "Arm");
  const TSubjectStoreId hand = Add(ESubjectKind::GeneralSubjects, "Hand");
  Set(hand, Paths::ParentSubjectId(), arm);
  Set(arm, Paths::ParentSubjectId(), body);
  std::vector<TSubjectStoreId> ids;
  EXPECT_TRUE(store->Reader()->Descendants(body, ids).Succeeded());
  EXPECT_THAT(ids, ElementsAre(body, arm, hand));
  {
    const auto editor = store->Editor();
    EXPECT_EQ(editor->SetValue(body, Paths::ParentSubjectId(), hand), IResult(EResult::InvalidValue));
    EXPECT_EQ(editor->SetValue(body, Paths::ParentSubjectId(), body), IResult(EResult::InvalidValue));
    EXPECT_EQ(editor->SetValue(body, Paths::ParentSubjectId(), TSubjectStoreId(99)), IResult(EResult::InvalidId));
    EXPECT_TRUE(editor->Remove(arm).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
  }
  EXPECT_FALSE(Get<TSubjectStoreId>(hand, Paths::ParentSubjectId()).Valid());
  EXPECT_TRUE(store->Reader()->Children(body, ids).Succeeded());
  EXPECT_TRUE(ids.empty());
}

TEST_F(StoreTest, ACharacterIsWarnedWhileAnObjectInItsSlotsHasWarnings)
{
  const NMX::EntryPath confusion("Warnings/WarningObjectConfusion");
  const TSubjectStoreId ada = Add(ESubjectKind::CharactersFromClusters, "Ada");
  const TSubjectStoreId glove = Add(ESubjectKind::SmartObjects, "Glove");
  const auto warned = [&] { return Get<bool>(ada, Paths::WarningCFCChildWarning()); };
  Set(glove, confusion, true);
  EXPECT_FALSE(warned());
  Set(glove, Paths::ParentSubjectId(), ada);
  EXPECT_TRUE(warned());
  Set(glove, confusion, false);
  EXPECT_FALSE(warned());
  Set(glove, confusion, true);
  EXPECT_TRUE(warned());
  Set(glove, Paths::ParentSubjectId(), TSubjectStoreId{});
  EXPECT_FALSE(warned());
  Set(glove, Paths::ParentSubjectId(), ada);
  const auto editor = store->Editor();
  EXPECT_TRUE(editor->Remove(glove).Succeeded());
  EXPECT_TRUE(editor->Commit().Succeeded());
  EXPECT_FALSE(warned());
}

TEST_F(StoreTest, ChangesAreToldOncePerCommitAndKindAfterTheStoreIsReleased)
{
  const auto postal = std::make_shared<ManualPostal>();
  int basic = 0;
  int smart = 0;
  int settings = 0;
  int exact = 0;
  const auto first = store->SubjectsChanged(ESubjectKind::BasicObjects)->Subscribe(postal, [&] { ++basic; });
  const auto second = store->SubjectsChanged(ESubjectKind::SmartObjects)->Subscribe(postal, [&] { ++smart; });
  const auto third = store->OnChange("Application/Settings/SubjectStore/*", postal, [&] { ++settings; });
  auto fourth = store->OnChange("Application/Settings/Other", postal, [&] { ++exact; });

  const TSubjectStoreId crate = Add(ESubjectKind::BasicObjects, "Crate");
  postal->RunAll();
  EXPECT_EQ(basic, 1);
  {
    const auto editor = store->Editor();
    EXPECT_TRUE(editor->SetValue(crate, Paths::Enabled(), false).Succeeded());
    EXPECT_TRUE(editor->SetValue(crate, Paths::Flags(), 0x41U).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
    EXPECT_EQ(postal->RunAll(), 1) << "one notification, told while the spent editor still lives";
    // The store is free: a handler may read and edit.
    EXPECT_TRUE(store->Editor()->Commit().Succeeded());
  }
  Set(crate, Paths::Enabled(), false); // no effect
  EXPECT_EQ(postal->RunAll(), 0);

  const auto setting = [&](const char* path, NMX::Value value)
  {
    const auto editor = store->Editor();
    EXPECT_TRUE(editor->SetApplicationEntry(NMX::EntryPath(path), std::move(value)).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
    postal->RunAll();
  };
  setting("Application/Settings/SubjectStore/CaptureVideo", true);
  setting("Application/Settings/SubjectStoreElsewhere", true);
  setting("Application/Settings/SubjectStore/CaptureVideo", true); // no effect
  EXPECT_EQ(settings, 1);
  setting("Application/Settings/Other", true);
  fourth.reset();
  setting("Application/Settings/Other", {});
  EXPECT_EQ(exact, 1);
  EXPECT_EQ(basic, 2);
  EXPECT_EQ(smart, 0);
}

TEST_F(StoreTest, AnEditOnAThreadThatStillReadsFailsInsteadOfWaitingForEver)
{
  static int assertions;
  assertions = 0;
  DebugServices::SetAssertFailHandler([](const char*, const char*, unsigned) { ++assertions; });
  const TSubjectStoreId crate = Add(ESubjectKind::BasicObjects, "Crate");
  {
    const auto editor = store->Editor();
    EXPECT_TRUE(editor->SetValue(crate, Paths::Enabled(), false).Succeeded());
    const auto reader = store->Reader();
    EXPECT_EQ(editor->Commit(), IResult(EResult::Conflict));
    EXPECT_EQ(assertions, 1);
  }
  const auto reader = store->Reader();
  const auto editor = store->Editor();
  EXPECT_EQ(assertions, 2);
  TSubjectStoreId id;
  EXPECT_EQ(editor->SetValue(crate, Paths::Enabled(), false), IResult(EResult::Conflict));
  EXPECT_EQ(editor->Add(ESubjectKind::Props, "Lamp", id), IResult(EResult::Conflict));
  EXPECT_EQ(editor->FindByName("Crate", id), IResult(EResult::NotFound));
  EXPECT_EQ(editor->Commit(), IResult(EResult::Conflict));
  DebugServices::SetAssertFailHandler(nullptr);
}

TEST(Store, ACommitThatCannotBeKeptChangesNothing)
{
  struct FullArchive : Store::IArchive
  {
    Store::ChangeSet Load() override { return {{}, {}, TSubjectStoreId(1)}; }
    IResult Keep(const Store::ChangeSet&, const Store::StoreState&) override
    {
      return full ? EResult::DiskFull : EResult::Ok;
    }
    bool full = false;
  };
  auto archive = std::make_unique<FullArchive>();
  FullArchive& disk = *archive;
  const auto store = NMX::MakeShared<Store::VStore>(std::move(archive));
  const auto postal = std::make_shared<ManualPostal>();
  const auto subscription = store->SubjectsChanged(ESubjectKind::Props)->Subscribe(postal, [] {});
  TSubjectStoreId id;
  const auto add = [&](const char* name)
  {
    const auto editor = store->Editor();
    EXPECT_TRUE(editor->Add(ESubjectKind::Props, name, id).Succeeded());
    return editor->Commit();
  };
  disk.full = true;
  EXPECT_EQ(add("Lamp"), IResult(EResult::DiskFull));
  EXPECT_TRUE(store->Empty());
  EXPECT_EQ(postal->RunAll(), 0);
  disk.full = false;
  EXPECT_EQ(add("Lamp"), IResult(EResult::Ok)) << "the fault has gone";
  EXPECT_EQ(postal->RunAll(), 1);
}

TEST(Store, ReadersSeeWholeCommitsWhileOtherThreadsEdit)
{
  const auto store = NMX::MakeShared<Store::VStore>();
  std::vector<TSubjectStoreId> ids(8);
  {
    const auto editor = store->Editor();
    for (std::size_t i = 0; i < ids.size(); ++i)
      ASSERT_TRUE(editor->Add(ESubjectKind::Props, "Prop " + std::to_string(i), ids[i]).Succeeded());
    ASSERT_TRUE(editor->Commit().Succeeded());
  }
  std::atomic<bool> done = false;
  std::atomic<int> torn = 0;
  std::vector<std::thread> threads;
  for (int writer = 0; writer < 2; ++writer)
    threads.emplace_back(
        [&, writer]
        {
          for (int round = 0; round < 300; ++round)
          {
            const auto editor = store->Editor();
            for (const TSubjectStoreId id : ids)
              (void)editor->SetValue(id, Paths::Enabled(), (round + writer) % 2 == 0);
            (void)editor->Commit();
          }
        });
  threads.emplace_back(
      [&]
      {
        while (!done)
        {
          const auto reader = store->Reader();
          bool first = false;
          (void)NMX::Read(*reader, ids[0], Paths::Enabled(), first);
          for (const TSubjectStoreId id : ids)
          {
            bool enabled = !first;
            (void)NMX::Read(*reader, id, Paths::Enabled(), enabled);
            torn += enabled != first ? 1 : 0;
          }
        }
      });
  threads[0].join();
  threads[1].join();
  done = true;
  threads[2].join();
  EXPECT_EQ(torn, 0);
}
