#include "RunaCorePluginSubjectStore/SmartObjectServices/VSmartObjectServices.h"

#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

#include <stdexcept>

using NMX::EResult;
using NMX::IResult;
using testing::_;
using testing::ElementsAre;
using testing::Return;
using testing::StrictMock;
namespace Paths = NMX::Paths;

namespace
{

class MockControls : public ISmartObjectControls
{
public:
  MOCK_METHOD(IResult, CreateFromTemplate, (const std::string&, const std::filesystem::path&, ECreate), (override));
  MOCK_METHOD(IResult, CreateForUnlinkedDevices, (std::vector<std::string>&), (override));
  MOCK_METHOD(IResult, CreateForDevices, (const std::vector<std::string>&, ECreate, std::vector<std::string>&),
              (override));
  MOCK_METHOD(IResult, AssignOptimalPatterns, (), (override));
  MOCK_METHOD(IResult, CheckPattern, (const NMX::IStoreReader&, const std::string&, std::uint32_t), (const, override));
};

struct Locations : IFileLocations
{
  std::vector<std::wstring> Directories(std::uint32_t location) const override
  {
    return location == 1024 ? folders : std::vector<std::wstring>{L"elsewhere"};
  }
  std::wstring UserDirectory(std::uint32_t /*location*/) const override { return {}; }
  std::vector<std::wstring> folders;
};

class SmartObjectServicesTest : public StoreFixture
{
protected:
  SmartObjectServicesTest()
  {
    Set(glove, Paths::SmartClusters(),
        std::vector<NMX::SmartCluster>{{"Back", "urn-1", 3, "Corvex1"}, {"Palm", "", 0, "Corvex1"}});
    Add(NMX::ESubjectKind::BasicObjects, "Crate");
    Add(NMX::ESubjectKind::CharactersFromClusters, "Ada");
  }

  std::shared_ptr<StrictMock<MockControls>> controls = std::make_shared<StrictMock<MockControls>>();
  std::shared_ptr<Locations> locations = std::make_shared<Locations>();
  std::shared_ptr<NMX::ISmartObjectServices> service =
      NMX::MakeShared<SmartObjectServices::VSmartObjectServices>(store, controls, locations);
  const Id glove = Add(NMX::ESubjectKind::SmartObjects, "Glove");
};

}

TEST_F(SmartObjectServicesTest, ClustersAreReadAndWrittenByTheirIndex)
{
  std::uint32_t number = 0;
  std::string text;
  EXPECT_TRUE(service->SmartClusterCount("Glove", number).Succeeded());
  EXPECT_EQ(number, 2U);
  EXPECT_TRUE(service->SetSmartClusterLabel("Glove", 1, "Inner hand").Succeeded());
  EXPECT_TRUE(service->SetSmartClusterDeviceURN("Glove", 1, "urn-2").Succeeded());
  EXPECT_TRUE(service->SetSmartClusterDeviceURN("Glove", 0, "").Succeeded());
  EXPECT_CALL(*controls, CheckPattern(_, "Corvex1", 8)).WillOnce(Return(EResult::Ok));
  EXPECT_TRUE(service->SetSmartClusterActiveMarkerPattern("Glove", 1, 8).Succeeded());
  EXPECT_CALL(*controls, CheckPattern(_, "Corvex1", 99)).WillOnce(Return(EResult::InvalidValue));
  EXPECT_EQ(service->SetSmartClusterActiveMarkerPattern("Glove", 0, 99), IResult(EResult::InvalidValue));
  EXPECT_TRUE(service->SmartClusterLabel("Glove", 1, text).Succeeded());
  EXPECT_EQ(text, "Inner hand");
  EXPECT_TRUE(service->SmartClusterDeviceURN("Glove", 1, text).Succeeded());
  EXPECT_EQ(text, "urn-2");
  EXPECT_TRUE(service->SmartClusterActiveMarkerPattern("Glove", 0, number).Succeeded());
  EXPECT_EQ(number, 3U);

  for (const std::uint32_t index : {2U, ~0U})
  {
    EXPECT_EQ(service->SmartClusterLabel("Glove", index, text), IResult(EResult::InvalidIndex));
    EXPECT_EQ(service->SetSmartClusterLabel("Glove", index, "x"), IResult(EResult::InvalidIndex));
    EXPECT_EQ(service->SmartClusterDeviceURN("Glove", index, text), IResult(EResult::InvalidIndex));
    EXPECT_EQ(service->SetSmartClusterDeviceURN("Glove", index, "x"), IResult(EResult::InvalidIndex));
    EXPECT_EQ(service->SmartClusterActiveMarkerPattern("Glove", index, number), IResult(EResult::InvalidIndex));
    EXPECT_EQ(service->SetSmartClusterActiveMarkerPattern("Glove", index, 1), IResult(EResult::InvalidIndex));
  }
  std::vector<NMX::SmartCluster> clusters;
  EXPECT_TRUE(NMX::Read(*store->Reader(), glove, Paths::SmartClusters(), clusters).Succeeded());
  EXPECT_THAT(clusters, ElementsAre(NMX::SmartCluster{"Back", "", 3, "Corvex1"},
                                    NMX::SmartCluster{"Inner hand", "urn-2", 8, "Corvex1"}));
}

TEST_F(SmartObjectServicesTest, ObjectsAreMadeByTheHostOnceTheNameHasPassed)
{
  using ECreate = ISmartObjectControls::ECreate;
  for (const char* name : {" Torch", "Torch ", " "})
    EXPECT_EQ(service->AddFromTemplate(name, "/x.sot"), IResult(EResult::InvalidName)) << name;
  EXPECT_CALL(*controls, CreateFromTemplate("", std::filesystem::path("/x.sot"), ECreate::Yes))
      .WillOnce(Return(EResult::InvalidName));
  EXPECT_EQ(service->AddFromTemplate("", "/x.sot"), IResult(EResult::InvalidName)) << "the host's decision";

  // The default template is in the first of the folders, or nowhere.
  EXPECT_CALL(*controls, CreateFromTemplate("Torch", std::filesystem::path(), ECreate::Yes))
      .WillOnce(Return(EResult::FileNotFound));
  EXPECT_EQ(service->Add("Torch"), IResult(EResult::FileNotFound));
  locations->folders = {L"/templates/Bühne", L"/others"};
  EXPECT_CALL(*controls, CreateFromTemplate("Torch", std::filesystem::path("/templates/B\xC3\xBChne/Corvex.sot"), _))
      .WillOnce(Return(EResult::OkButModified));
  EXPECT_EQ(service->Add("Torch"), IResult(EResult::OkButModified));

  EXPECT_CALL(*controls, CreateForUnlinkedDevices(_)).WillOnce(Return(EResult::AllocationFailure));
  EXPECT_EQ(service->CreateSmartObjects(), IResult(EResult::AllocationFailure));
  const LogCapture log;
  EXPECT_CALL(*controls, AssignOptimalPatterns()).WillOnce(testing::Throw(std::runtime_error("out of order")));
  EXPECT_EQ(service->AssignOptimalActiveMarkerPatterns(), IResult(EResult::FailedWithException));
}

TEST_F(SmartObjectServicesTest, WithoutControlsNothingIsMadeWhateverTheName)
{
  service = NMX::MakeShared<SmartObjectServices::VSmartObjectServices>(store, nullptr, nullptr);
  EXPECT_EQ(service->Add(" bad ").Code(), 0x80000005U);
  EXPECT_EQ(service->AddFromTemplate(" bad ", "").Code(), 0x80000005U);
  EXPECT_EQ(service->CreateSmartObjects().Code(), 0x80000005U);
  EXPECT_EQ(service->AssignOptimalActiveMarkerPatterns().Code(), 0x80000005U);
  std::set<std::string> names;
  EXPECT_TRUE(service->SmartObjectList(names).Succeeded());
  EXPECT_THAT(names, ElementsAre("Glove"));
}

TEST_F(SmartObjectServicesTest, PatternManagementIsASettingOfTheStore)
{
  bool enabled = true;
  EXPECT_TRUE(service->AutoPatternManagementEnabled(enabled).Succeeded());
  EXPECT_FALSE(enabled);
  const auto postal = std::make_shared<ManualPostal>();
  int changes = 0;
  const auto subscription =
      store->OnChange("Application/Settings/SmartObjects/AutoPatternManagement", postal, [&] { ++changes; });
  EXPECT_TRUE(service->SetAutoPatternManagementEnabled(true).Succeeded());
  EXPECT_TRUE(service->AutoPatternManagementEnabled(enabled).Succeeded());
  EXPECT_TRUE(enabled);
  postal->RunAll();
  EXPECT_EQ(changes, 1);
}

TEST(DeviceTypes, ThreeAreRegisteredOfWhichOneIsCompatible)
{
  struct Registry : RunaCorePluginInterface::IDeviceLayoutRegistry
  {
    void Register(const RunaCorePluginInterface::DeviceLayout& layout) override { layouts.push_back(layout); }
    std::vector<RunaCorePluginInterface::DeviceLayout> layouts;
  } registry;
  SmartObjectServices::RegisterDeviceTypes(registry);
  ASSERT_EQ(registry.layouts.size(), 3U);
  std::vector<std::string> described;
  for (const auto& layout : registry.layouts)
  {
    double sum = 0;
    for (const auto& marker : layout.markers)
      sum += marker.x + 2 * marker.y + 4 * marker.z;
    described.push_back(std::string(layout.type) + " " + std::to_string(layout.markers.size()) + " " +
                        std::to_string(sum));
  }
  EXPECT_THAT(described,
              ElementsAre("Corvex1 8 347.200000", "Quarex10 10 516.500000", "VelaParkHeadsetV1 15 -519.536646"));
  EXPECT_THAT(SmartObjectServices::CompatibleDeviceTypes(), ElementsAre("Corvex1"));
}
