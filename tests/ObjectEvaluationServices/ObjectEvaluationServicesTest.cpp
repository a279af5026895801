#include "RunaCorePluginSubjectStore/ObjectEvaluationServices/VObjectEvaluationServices.h"

#include "StandaloneHost/Store/VStore.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"

#include <gmock/gmock.h>

#include <stdexcept>

using NMX::EResult;
using NMX::IResult;
using testing::_;
using testing::DoAll;
using testing::Return;
using testing::SetArgReferee;
using testing::StrictMock;
using Id = NMX::TSubjectStoreId;

namespace
{

class MockEngine : public RunaCorePluginInterface::IObjectEvaluationSettings
{
public:
  MOCK_METHOD(IResult, Enabled, (bool&), (const, override));
  MOCK_METHOD(IResult, SetEnabled, (bool), (override));
  MOCK_METHOD(IResult, MaximumEvaluationStepCount, (std::uint64_t&), (const, override));
  MOCK_METHOD(IResult, SetMaximumEvaluationStepCount, (std::uint64_t), (override));
  MOCK_METHOD(IResult, WarningThreshold, (double&), (const, override));
  MOCK_METHOD(IResult, SetWarningThreshold, (double), (override));
  MOCK_METHOD(IResult, Progress, (std::uint64_t&, std::uint64_t&), (const, override));
  MOCK_METHOD(IResult, HighestStepCountReached, (std::uint64_t&), (const, override));
  MOCK_METHOD(IResult, MatchDistance, (const NMX::IStoreReader&, Id, Id, bool&, double&), (const, override));

  NMX::Subscription OnChange(std::function<void()> handler) override
  {
    report = std::move(handler);
    return std::make_shared<int>();
  }

  std::function<void()> report;
};

class ObjectEvaluationServicesTest : public testing::Test
{
protected:
  ObjectEvaluationServicesTest()
  {
    const auto editor = store->Editor();
    EXPECT_TRUE(editor->Add(NMX::ESubjectKind::BasicObjects, "Crate", crate).Succeeded());
    EXPECT_TRUE(editor->Add(NMX::ESubjectKind::SmartObjects, "Glove", glove).Succeeded());
    Id other;
    EXPECT_TRUE(editor->Add(NMX::ESubjectKind::CharactersFromClusters, "Ada", other).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
  }

  std::shared_ptr<Store::VStore> store = NMX::MakeShared<Store::VStore>();
  std::shared_ptr<StrictMock<MockEngine>> engine = std::make_shared<StrictMock<MockEngine>>();
  std::shared_ptr<NMX::IObjectEvaluationServices> service =
      ObjectEvaluationServices::VObjectEvaluationServices::Make(store, engine);
  Id crate;
  Id glove;
};

}

TEST_F(ObjectEvaluationServicesTest, SettingsAndProgressAreTheEnginesAsTheyAre)
{
  EXPECT_CALL(*engine, Enabled(_)).WillOnce(DoAll(SetArgReferee<0>(true), Return(EResult::OkButModified)));
  bool enabled = false;
  EXPECT_EQ(service->Enabled(enabled), IResult(EResult::OkButModified));
  EXPECT_TRUE(enabled);

  EXPECT_CALL(*engine, Progress(_, _))
      .WillOnce(DoAll(SetArgReferee<0>(3U), SetArgReferee<1>(9U), Return(EResult::Ok)))
      .WillOnce(Return(EResult::NotAvailable));
  std::uint64_t done = 0;
  std::uint64_t required = 0;
  EXPECT_TRUE(service->Progress(done, required).Succeeded());
  EXPECT_EQ(done, 3U);
  EXPECT_EQ(required, 9U);
  EXPECT_EQ(service->Progress(done, required), IResult(EResult::NotAvailable));

  EXPECT_CALL(*engine, SetWarningThreshold(-1.0)).WillOnce(Return(EResult::InvalidValue));
  EXPECT_EQ(service->SetWarningThreshold(-1.0), IResult(EResult::InvalidValue));
  EXPECT_CALL(*engine, SetMaximumEvaluationStepCount(~0ULL)).WillOnce(Return(EResult::Ok));
  EXPECT_TRUE(service->SetMaximumEvaluationStepCount(~0ULL).Succeeded());

  const LogCapture log;
  EXPECT_CALL(*engine, SetEnabled(true)).WillOnce(testing::Throw(std::runtime_error("out of order")));
  EXPECT_EQ(service->SetEnabled(true), IResult(EResult::FailedWithException));
}

TEST_F(ObjectEvaluationServicesTest, MatchDistanceAsksTheEngineOnlyForTwoObjects)
{
  bool matches = true;
  double distance = 1;
  for (const auto& [first, second] :
       {std::pair("Nobody", "Crate"), {"Crate", "Nobody"}, {"Ada", "Crate"}, {"Glove", "Ada"}, {"", ""}})
    EXPECT_EQ(service->MatchDistance(first, second, matches, distance).Code(), 0x8000000FU) << first << second;
  EXPECT_TRUE(matches);

  EXPECT_CALL(*engine, MatchDistance(_, glove, crate, _, _))
      .WillOnce(DoAll(SetArgReferee<3>(false), SetArgReferee<4>(7.5), Return(EResult::Ok)));
  EXPECT_TRUE(service->MatchDistance("Glove", "Crate", matches, distance).Succeeded());
  EXPECT_FALSE(matches);
  EXPECT_EQ(distance, 7.5);
  EXPECT_CALL(*engine, MatchDistance(_, crate, crate, _, _)).WillOnce(Return(EResult::NotFound));
  EXPECT_EQ(service->MatchDistance("Crate", "Crate", matches, distance), IResult(EResult::NotFound));
}

TEST_F(ObjectEvaluationServicesTest, RaisesItsCallbackWhenTheEngineReportsAndNotAfterItsEnd)
{
  const auto postal = std::make_shared<ManualPostal>();
  int raised = 0;
  const auto subscription = service->EvaluationChangedCallback()->Subscribe(postal, [&] { ++raised; });
  engine->report();
  engine->report();
  EXPECT_EQ(raised, 0) << "never inside of the report";
  postal->RunAll();
  EXPECT_EQ(raised, 2);

  // The engine may still be about to report when the service goes.
  const std::weak_ptr<NMX::IObjectEvaluationServices> gone = service;
  service.reset();
  EXPECT_TRUE(gone.expired());
  engine->report();
  EXPECT_EQ(postal->RunAll(), 0);
}

TEST_F(ObjectEvaluationServicesTest, WithoutAnEngineNothingIsSupported)
{
  service = ObjectEvaluationServices::VObjectEvaluationServices::Make(store, nullptr);
  bool flag = false;
  double number = 0;
  std::uint64_t count = 0;
  EXPECT_EQ(service->Enabled(flag), IResult(EResult::NotSupported));
  EXPECT_EQ(service->SetEnabled(true), IResult(EResult::NotSupported));
  EXPECT_EQ(service->HighestStepCountReached(count), IResult(EResult::NotSupported));
  EXPECT_EQ(service->MatchDistance("Crate", "Crate", flag, number), IResult(EResult::NotSupported));
}
