#include "RunaCorePluginSubjectStore/CharacterFromClustersServices/VCharacterFromClustersServices.h"

#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/MockStore.h"
#include "tests/Support/StoreFixture.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

using NMX::EResult;
using NMX::IResult;
using Id = NMX::TSubjectStoreId;
using Service = CharacterFromClustersServices::VCharacterFromClustersServices;
using EState = NMX::ICharacterFromClustersServices::ECharacterCalibrationState;
using testing::_;
using testing::ElementsAre;
using testing::Return;
using testing::StrictMock;
namespace Paths = NMX::Paths;

namespace
{

class MockControls : public ICharacterControls
{
public:
  MOCK_METHOD(IResult, CreateFromTemplate, (NMX::IEntryEditor&, const std::string&, const ICharacterTemplate&),
              (override));
  MOCK_METHOD(IResult, Calibrate, (NMX::IEntryEditor&, Id), (override));
  MOCK_METHOD(IResult, ClearCalibration, (NMX::IEntryEditor&, Id), (override));
  MOCK_METHOD(IResult, ReadTemplate, (const std::filesystem::path&, std::shared_ptr<const ICharacterTemplate>&),
              (const, override));
};

class CharacterServicesTest : public StoreFixture
{
protected:
  CharacterServicesTest()
  {
    Set(ada, Paths::Slots(), std::vector<NMX::Slot>{{Id(7), "Pelvis"}, {Id(3), "Hand"}, {Id(5), "Hand"}});
  }

  /// The names of the objects in Ada's slots.
  std::vector<std::string> Objects() const
  {
    std::vector<std::string> names(3, "unread");
    for (std::uint32_t slot = 0; slot < 3; ++slot)
      EXPECT_TRUE(service->SlotObject("Ada", slot, names[slot]).Succeeded());
    return names;
  }

  std::shared_ptr<StrictMock<MockControls>> controls = std::make_shared<StrictMock<MockControls>>();
  std::shared_ptr<NMX::ICharacterFromClustersServices> service = NMX::MakeShared<Service>(controls, store);
  const Id ada = Add(NMX::ESubjectKind::CharactersFromClusters, "Ada");
  const Id belt = Add(NMX::ESubjectKind::BasicObjects, "Belt");
  const Id glove = Add(NMX::ESubjectKind::SmartObjects, "Glove");
  const Id chair = Add(NMX::ESubjectKind::Props, "Chair");
};

}

TEST_F(CharacterServicesTest, AnObjectIsInOneSlotAndASlotHoldsOneObject)
{
  EXPECT_TRUE(service->SetSlotObject("Ada", 0, "Belt").Succeeded());
  EXPECT_TRUE(service->SetSlotObject("Ada", 2, "Glove").Succeeded());
  EXPECT_THAT(Objects(), ElementsAre("Belt", "", "Glove"));
  EXPECT_EQ(Get<Id>(glove, Paths::ParentSubjectId()), ada);
  EXPECT_EQ(Get<Id>(glove, Paths::ParentSubjectSlotId()), Id(5));
  EXPECT_TRUE(service->SetSlotObject("Ada", 1, "Glove").Succeeded());
  EXPECT_THAT(Objects(), ElementsAre("Belt", "Glove", ""));
  EXPECT_TRUE(service->SetSlotObject("Ada", 1, "Belt").Succeeded());
  EXPECT_THAT(Objects(), ElementsAre("", "Belt", ""));
  EXPECT_FALSE(Get<Id>(glove, Paths::ParentSubjectId()).Valid());
  EXPECT_TRUE(service->SetSlotObject("Ada", 1, "Belt").Succeeded());
  EXPECT_TRUE(service->SetSlotObject("Ada", 1, "").Succeeded());
  EXPECT_TRUE(service->SetSlotObject("Ada", 1, "").Succeeded());
  EXPECT_THAT(Objects(), ElementsAre("", "", ""));
  EXPECT_FALSE(Get<Id>(belt, Paths::ParentSubjectSlotId()).Valid());
  std::vector<std::string> names;
  EXPECT_TRUE(service->SlotNames("Ada", names).Succeeded());
  EXPECT_THAT(names, ElementsAre("Pelvis", "Hand", "Hand"));

  // The character, then the index, then the object's name, then its kind.
  EXPECT_TRUE(service->SetSlotObject("Ada", 0, "Belt").Succeeded());
  EXPECT_EQ(service->SetSlotObject("Bob", 9, "Nothing"), IResult(EResult::NotFound));
  EXPECT_EQ(service->SetSlotObject("Belt", 9, "Nothing"), IResult(EResult::NotSupported));
  EXPECT_EQ(service->SetSlotObject("Ada", 3, "Nothing"), IResult(EResult::InvalidIndex));
  EXPECT_EQ(service->SetSlotObject("Ada", 0, "Nothing"), IResult(EResult::NotFound));
  for (const char* name : {"Chair", "Ada"})
    EXPECT_EQ(service->SetSlotObject("Ada", 0, name).Code(), 0x80000017U) << name;
  std::string object;
  EXPECT_EQ(service->SlotObject("Ada", ~0U, object), IResult(EResult::InvalidIndex));
  EXPECT_THAT(Objects(), ElementsAre("Belt", "", ""));
}

TEST_F(CharacterServicesTest, AChangeOfAnObjectInASlotIsOneOfTheCharacter)
{
  const auto postal = std::make_shared<ManualPostal>();
  int changes = 0;
  const auto subscription = service->CharacterChangedCallback()->Subscribe(postal, [&] { ++changes; });
  const auto changesOf = [&](auto edit)
  {
    changes = 0;
    const auto editor = store->Editor();
    EXPECT_TRUE(edit(*editor).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
    postal->RunAll();
    return changes;
  };
  EXPECT_TRUE(service->SetSlotObject("Ada", 0, "Belt").Succeeded());
  postal->RunAll();
  EXPECT_EQ(changes, 1);
  EXPECT_EQ(changesOf([&](NMX::IEntryEditor& editor) { return editor.Rename(belt, "Girdle", NMX::ENotify::Yes); }), 1);
  EXPECT_EQ(
      changesOf([&](NMX::IEntryEditor& editor) { return editor.SetValue(belt, Paths::ParentSubjectSlotId(), Id(3)); }),
      1);
  EXPECT_THAT(Objects(), ElementsAre("", "Girdle", ""));
  EXPECT_EQ(changesOf([&](NMX::IEntryEditor& editor) { return editor.Rename(glove, "Mitten", NMX::ENotify::Yes); }), 0);
  EXPECT_EQ(changesOf([&](NMX::IEntryEditor& editor) { return editor.Remove(belt); }), 1);
  EXPECT_THAT(Objects(), ElementsAre("", "", ""));
}

TEST_F(CharacterServicesTest, ARetargetPathIsOneOfTheHostOrNone)
{
  const TemporaryFolder folder;
  const std::string path = (folder.Path() / "R\xC3\xBC"
                                            "ckw\xC3\xA4rts")
                               .string();
  std::string answer;
  EXPECT_EQ(service->SetCharacterRetargetPath("Ada", path).Code(), 0x8000002AU);
  std::filesystem::create_directory(path);
  EXPECT_TRUE(service->SetCharacterRetargetPath("Ada", path).Succeeded()) << "a folder passes";
  EXPECT_EQ(service->SetCharacterRetargetPath("Bob", "/missing"), IResult(EResult::NotFound));
  EXPECT_EQ(service->SetCharacterRetargetPath("Belt", "/missing"), IResult(EResult::NotSupported));
  EXPECT_EQ(service->SetCharacterRetargetPath("Ada", std::string(5000, 'x')), IResult(EResult::FileNotFound));
  EXPECT_EQ(service->SetCharacterRetargetPath("Ada", path + std::string(1, '\0')), IResult(EResult::InvalidArgument));
  EXPECT_EQ(service->SetCharacterRetargetPath("Ada", "\xFF"), IResult(EResult::InvalidArgument));
  EXPECT_TRUE(service->CharacterRetargetPath("Ada", answer).Succeeded());
  EXPECT_EQ(answer, path);
  EXPECT_TRUE(service->SetCharacterRetargetPath("Ada", "").Succeeded());
  EXPECT_TRUE(service->CharacterRetargetPath("Ada", answer).Succeeded());
  EXPECT_EQ(answer, "");
}

TEST_F(CharacterServicesTest, TheStatesOfCalibrationAreThoseOfTheStore)
{
  for (const auto& [number, state] : {std::pair(1, EState::Calibrating),
                                      {2, EState::Calibrated},
                                      {0, EState::Uncalibrated},
                                      {5, EState::Uncalibrated},
                                      {-1, EState::Uncalibrated}})
  {
    Set(ada, Paths::Calibration(), number);
    EState answer{99};
    EXPECT_TRUE(service->CharacterCalibrationState("Ada", answer).Succeeded());
    EXPECT_EQ(answer, state) << number;
  }
}

TEST_F(CharacterServicesTest, TheHostMakesAndCalibratesInAnEditThatIsKeptOnlyOnSuccess)
{
  for (const char* name : {" Bob", "Bob ", " "})
    EXPECT_EQ(service->CreateCharacter(name, "/x.cct"), IResult(EResult::InvalidName)) << name;
  EXPECT_EQ(service->CreateCharacter("Bob", "\xFF"), IResult(EResult::InvalidArgument));
  const auto add = [](NMX::IEntryEditor& editor, const std::string& name)
  {
    Id id;
    EXPECT_TRUE(editor.Add(NMX::ESubjectKind::CharactersFromClusters, name, id).Succeeded());
  };
  EXPECT_CALL(*controls, ReadTemplate(std::filesystem::path(""), _)).WillOnce(Return(EResult::InvalidArgument));
  EXPECT_EQ(service->CreateCharacter("Bob", ""), IResult(EResult::InvalidArgument));
  const auto content = std::make_shared<const ICharacterTemplate>();
  EXPECT_CALL(*controls, ReadTemplate(std::filesystem::path("/x.cct"), _))
      .WillRepeatedly(
          [&](const std::filesystem::path&, std::shared_ptr<const ICharacterTemplate>& read)
          {
            add(*store->Editor(), "Eve"); // an edit can begin, as none is open
            read = content;
            return IResult(EResult::Ok);
          });
  for (const EResult created : {EResult::AllocationFailure, EResult::Ok})
  {
    EXPECT_CALL(*controls, CreateFromTemplate(_, "Eve", testing::Ref(*content)))
        .WillOnce(
            [&](NMX::IEntryEditor& editor, const std::string& name, const ICharacterTemplate&)
            {
              add(editor, name);
              return IResult(created);
            });
    EXPECT_EQ(service->CreateCharacter("Eve", "/x.cct"), IResult(created));
  }
  std::set<std::string> names;
  EXPECT_TRUE(service->CharacterList(names).Succeeded());
  EXPECT_THAT(names, ElementsAre("Ada", "Eve"));

  EXPECT_CALL(*controls, Calibrate(_, ada)).WillOnce(Return(EResult::NotAvailable));
  EXPECT_EQ(service->CalibrateCharacter("Ada"), IResult(EResult::NotAvailable));
  EXPECT_CALL(*controls, ClearCalibration(_, ada)).WillOnce(Return(EResult::Ok));
  EXPECT_TRUE(service->ClearCharacterCalibration("Ada").Succeeded());
  EXPECT_EQ(service->CalibrateCharacter("Bob"), IResult(EResult::NotFound));
  EXPECT_EQ(service->ClearCharacterCalibration("Glove"), IResult(EResult::NotSupported));

  service = NMX::MakeShared<Service>(nullptr, store);
  EXPECT_EQ(service->CreateCharacter("Zoe", "/x.cct"), IResult(EResult::NotSupported));
  EXPECT_EQ(service->CalibrateCharacter("Ada"), IResult(EResult::NotSupported));
  EXPECT_EQ(service->ClearCharacterCalibration("Ada"), IResult(EResult::NotSupported));
}

TEST(CharacterServices, ANameThatCannotBeReadIsLoggedAndLeftOut)
{
  const auto store = std::make_shared<MockStore>();
  EXPECT_CALL(*store, Reader())
      .WillOnce(
          []
          {
            auto reader = std::make_unique<testing::NiceMock<MockEditor>>();
            EXPECT_CALL(*reader, Subjects(NMX::ESubjectKind::CharactersFromClusters, _))
                .WillOnce(testing::DoAll(testing::SetArgReferee<1>(std::vector{Id(12)}), Return(EResult::Ok)));
            EXPECT_CALL(*reader, Find(Id(12), _, _)).WillOnce(Return(EResult::InvalidId));
            return reader;
          });
  const LogCapture log;
  std::set<std::string> names{"old"};
  EXPECT_TRUE(NMX::MakeShared<Service>(nullptr, store)->CharacterList(names).Succeeded());
  EXPECT_THAT(names, testing::IsEmpty());
  EXPECT_THAT(log.messages, ElementsAre("Failed to read subject name for store id 12"));
}
