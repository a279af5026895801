#include "RunaCorePluginSubjectStore/BasicObjectServices/VBasicObjectServices.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/MockStore.h"
#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

#include <stdexcept>

using NMX::EResult;
using NMX::IResult;
using testing::_;
using testing::ElementsAre;
using testing::NiceMock;
using testing::Pair;
using testing::Return;
using testing::SetArgReferee;
namespace Paths = NMX::Paths;

namespace
{

class BasicObjectServicesTest : public StoreFixture
{
protected:
  BasicObjectServicesTest()
  {
    Add(NMX::ESubjectKind::BasicObjects, "Sword");
    Add(NMX::ESubjectKind::SmartObjects, "Glove");
    Add(NMX::ESubjectKind::CharactersFromClusters, "Ada");
  }

  std::set<std::string> List()
  {
    std::set<std::string> names;
    EXPECT_TRUE(service->BasicObjectList(names).Succeeded());
    return names;
  }

  std::shared_ptr<NMX::IBasicObjectServices> service =
      NMX::MakeShared<BasicObjectServices::VBasicObjectServices>(store);
  const Id crate = Add(NMX::ESubjectKind::BasicObjects, "Crate");
};

}

TEST_F(BasicObjectServicesTest, RenameChecksTheNewNameAndChangesNothingWhenItRefuses)
{
  const struct
  {
    const char* name;
    EResult result;
  } cases[] = {
      {" Box", EResult::InvalidName},     {"Box ", EResult::InvalidName},     {" ", EResult::InvalidName},
      {"", EResult::InvalidName},         {"Bo\nx", EResult::InvalidName},    {"A/B", EResult::InvalidName},
      {"Sword", EResult::AlreadyPresent}, {"Glove", EResult::AlreadyPresent}, {"Ada", EResult::AlreadyPresent}};
  for (const auto& c : cases)
    EXPECT_EQ(service->Rename("Crate", c.name), IResult(c.result)) << c.name;
  EXPECT_EQ(service->Rename("Crate", std::string(256, 'x')), IResult(EResult::InvalidName));
  EXPECT_THAT(List(), ElementsAre("Crate", "Sword"));

  EXPECT_TRUE(service->Rename("Crate", "Crate").Succeeded());
  EXPECT_TRUE(service->Rename("Crate", "Wooden box \xC3\xA9").Succeeded());
  EXPECT_THAT(List(), ElementsAre("Sword", "Wooden box \xC3\xA9"));
}

TEST_F(BasicObjectServicesTest, WarningsAreThoseThatHoldInTheirOrderWithTheirTexts)
{
  using Warning = NMX::IBasicObjectServices::EBasicObjectWarning;
  std::map<Warning, std::string> warnings{{Warning::ObjectConfusion, "stale"}};
  EXPECT_TRUE(service->BasicObjectWarnings("Crate", warnings).Succeeded());
  EXPECT_TRUE(warnings.empty());

  Set(crate, NMX::EntryPath("Warnings/WarningObjectConfusion"), true);
  Set(crate, Paths::TemplateGroupName(), std::string("Crates"));
  Set(crate, NMX::EntryPath("Warnings/WarningBatteryLow"), true); // not one of a basic object
  EXPECT_TRUE(service->BasicObjectWarnings("Crate", warnings).Succeeded());
  EXPECT_THAT(warnings, ElementsAre(Pair(Warning::TemplateGroupNoProximityGroup,
                                         "Object is in a template group, but isn't in a proximity group."),
                                    Pair(Warning::ObjectConfusion,
                                         "Object could be confused with another object, or another view of itself.")));
}

TEST_F(BasicObjectServicesTest, ListWideOperationsReachBasicObjectsOnly)
{
  EXPECT_TRUE(service->SetAllEnabled(false).Succeeded());
  bool flag = true;
  EXPECT_TRUE(service->Enabled("Sword", flag).Succeeded());
  EXPECT_FALSE(flag);

  EXPECT_TRUE(service->RemoveAll().Succeeded());
  EXPECT_TRUE(List().empty());
  EXPECT_TRUE(service->RemoveAll().Succeeded());
  NMX::TSubjectStoreId id;
  const auto reader = store->Reader();
  EXPECT_TRUE(reader->FindByName("Glove", id).Succeeded());
  EXPECT_TRUE(NMX::Read(*reader, id, Paths::Enabled(), flag).Succeeded());
  EXPECT_TRUE(flag);
}

namespace
{

/// A service over a store whose editor the test decides.
struct Refusing
{
  explicit Refusing(std::unique_ptr<NiceMock<MockEditor>> editor)
  {
    ON_CALL(*editor, Subjects(_, _))
        .WillByDefault(testing::DoAll(SetArgReferee<1>(std::vector{NMX::TSubjectStoreId(1), NMX::TSubjectStoreId(2)}),
                                      Return(EResult::Ok)));
    ON_CALL(*store, Editor()).WillByDefault(Return(testing::ByMove(std::move(editor))));
  }

  std::shared_ptr<NiceMock<MockStore>> store = std::make_shared<NiceMock<MockStore>>();
  std::shared_ptr<NMX::IBasicObjectServices> service =
      NMX::MakeShared<BasicObjectServices::VBasicObjectServices>(store);
};

}

TEST(BasicObjectServicesOverARefusingStore, RemoveAllSucceedsAlthoughEachRemovalIsRefused)
{
  auto editor = std::make_unique<NiceMock<MockEditor>>();
  EXPECT_CALL(*editor, Remove(_)).Times(2).WillRepeatedly(Return(EResult::NotPermitted));
  Refusing refusing(std::move(editor));
  EXPECT_EQ(refusing.service->RemoveAll(), IResult(EResult::Ok));
}

TEST(BasicObjectServicesOverARefusingStore, FailuresOfListingAndKeepingComeThrough)
{
  auto listing = std::make_unique<NiceMock<MockEditor>>();
  EXPECT_CALL(*listing, Subjects(_, _)).WillOnce(Return(EResult::NotAvailable));
  EXPECT_EQ(Refusing(std::move(listing)).service->RemoveAll(), IResult(EResult::NotAvailable));

  auto keeping = std::make_unique<NiceMock<MockEditor>>();
  EXPECT_CALL(*keeping, Commit()).WillOnce(Return(EResult::DiskFull));
  EXPECT_EQ(Refusing(std::move(keeping)).service->RemoveAll(), IResult(EResult::DiskFull));

  auto setting = std::make_unique<NiceMock<MockEditor>>();
  EXPECT_CALL(*setting, SetValue(_, _, _, _)).WillOnce(Return(EResult::NotPermitted));
  EXPECT_CALL(*setting, Commit()).Times(0);
  EXPECT_EQ(Refusing(std::move(setting)).service->SetAllEnabled(true), IResult(EResult::NotPermitted));
}

TEST(BasicObjectServicesOverARefusingStore, AnExceptionBecomesAResultAndAnUnreadableNameALogLine)
{
  LogCapture log;
  auto editor = std::make_unique<NiceMock<MockEditor>>();
  EXPECT_CALL(*editor, FindByName(_, _)).WillOnce(testing::Throw(std::runtime_error("broken store")));
  EXPECT_EQ(Refusing(std::move(editor)).service->Remove("Crate"), IResult(EResult::FailedWithException));
  EXPECT_THAT(log.messages, ElementsAre("A subject operation failed: broken store"));

  log.messages.clear();
  Refusing refusing(std::make_unique<NiceMock<MockEditor>>());
  auto reader = std::make_unique<NiceMock<MockEditor>>();
  ON_CALL(*reader, Subjects(_, _))
      .WillByDefault(testing::DoAll(SetArgReferee<1>(std::vector{NMX::TSubjectStoreId(7)}), Return(EResult::Ok)));
  ON_CALL(*reader, Find(_, _, _)).WillByDefault(Return(EResult::InvalidId));
  ON_CALL(*refusing.store, Reader()).WillByDefault(Return(testing::ByMove(std::move(reader))));
  std::set<std::string> names;
  EXPECT_TRUE(refusing.service->BasicObjectList(names).Succeeded());
  EXPECT_TRUE(names.empty());
  EXPECT_THAT(log.messages, ElementsAre("Failed to get subject name for store id 7"));
}
