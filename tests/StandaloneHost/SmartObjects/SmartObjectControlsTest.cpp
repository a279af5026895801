#include "StandaloneHost/SmartObjects/VSmartObjectControls.h"

#include "StandaloneHost/SmartObjects/AutoPatternManagement.h"
#include "StandaloneHost/SmartObjects/PatternSets.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"
#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>

#include <array>
#include <fstream>
#include <memory>

using NMX::EResult;
using NMX::IResult;
using testing::ElementsAre;
using testing::HasSubstr;
using Id = NMX::TSubjectStoreId;
using ECreate = ISmartObjectControls::ECreate;
namespace Paths = NMX::Paths;

namespace
{

class SmartObjectControlsTest : public StoreFixture
{
protected:
  SmartObjectControlsTest()
  {
    static constexpr std::array<RunaCorePluginInterface::MarkerPlace, 1> markers{{{0, 0, 0}}};
    for (const char* type : {"Corvex1", "Quarex10"})
      layouts->Register({type, markers});
  }

  void AddObject(const std::string& name, std::vector<NMX::SmartCluster> clusters)
  {
    Set(Add(NMX::ESubjectKind::SmartObjects, name), Paths::SmartClusters(), std::move(clusters));
  }

  void AddDevice(const std::string& urn, const std::string& type)
  {
    SetApplication("Application/Devices/" + urn + "/Type", type);
  }

  std::vector<std::uint32_t> Patterns() const
  {
    const auto reader = store->Reader();
    std::vector<Id> ids;
    EXPECT_TRUE(reader->Subjects(NMX::ESubjectKind::SmartObjects, ids).Succeeded());
    std::vector<std::uint32_t> patterns;
    for (const Id id : ids)
    {
      std::vector<NMX::SmartCluster> clusters;
      EXPECT_TRUE(NMX::Read(*reader, id, Paths::SmartClusters(), clusters).Succeeded());
      for (const auto& cluster : clusters)
        patterns.push_back(cluster.pattern);
    }
    return patterns;
  }

  std::filesystem::path Template(const std::string& clusters) const
  {
    const auto file = folder.Path() / "object.sot";
    std::ofstream(file) << "<SmartObjectTemplate version=\"1\"><SmartClusters>" << clusters
                        << "</SmartClusters><AdditionalMarkerPositions><Marker x=\"1\" y=\"2\" z=\"3\"/>"
                           "</AdditionalMarkerPositions></SmartObjectTemplate>";
    return file;
  }

  const TemporaryFolder folder;
  std::shared_ptr<SmartObjects::DeviceLayouts> layouts = std::make_shared<SmartObjects::DeviceLayouts>();
  std::shared_ptr<SmartObjects::VSmartObjectControls> controls =
      std::make_shared<SmartObjects::VSmartObjectControls>(store, layouts);
};

NMX::SmartCluster Cluster(std::uint32_t pattern, const char* type = "Corvex1", const char* urn = "")
{
  return {"C", urn, pattern, type};
}

}

TEST_F(SmartObjectControlsTest, MakesWhatTheTemplateSaysOrNothing)
{
  const LogCapture log;
  const auto file = Template(R"(<SmartCluster label="A" type="Corvex1"/><SmartCluster label="B" type="Corvex1"/>)");
  EXPECT_TRUE(controls->CreateFromTemplate("Belt", file, ECreate::No).Succeeded());
  EXPECT_TRUE(store->Empty()) << "it was only asked whether";
  EXPECT_TRUE(controls->CreateFromTemplate("Belt", file, ECreate::Yes).Succeeded());
  Id id;
  std::vector<NMX::SmartCluster> clusters;
  std::vector<NMX::Position> markers;
  EXPECT_TRUE(store->Reader()->FindByName("Belt", id).Succeeded());
  EXPECT_TRUE(NMX::Read(*store->Reader(), id, Paths::SmartClusters(), clusters).Succeeded());
  EXPECT_TRUE(NMX::Read(*store->Reader(), id, Paths::AdditionalMarkerPositions(), markers).Succeeded());
  EXPECT_THAT(clusters,
              ElementsAre(NMX::SmartCluster{"A", "", 1, "Corvex1"}, NMX::SmartCluster{"B", "", 2, "Corvex1"}));
  EXPECT_THAT(markers, ElementsAre(NMX::Position{1, 2, 3}));

  const int commits = archive.commits;
  const auto make = [&](const std::string& name, const std::filesystem::path& from)
  { return controls->CreateFromTemplate(name, from, ECreate::Yes); };
  EXPECT_EQ(make("", file), IResult(EResult::InvalidName));
  EXPECT_EQ(make("Belt", file), IResult(EResult::AlreadyPresent));
  EXPECT_EQ(make("Belt", "/missing"), IResult(EResult::AlreadyPresent)) << "the name is told first";
  EXPECT_EQ(make("Cap", ""), IResult(EResult::FileNotFound));
  EXPECT_EQ(make("Cap", folder.Path() / "missing.sot"), IResult(EResult::FileNotFound));
  EXPECT_EQ(make("Cap", std::string("/a\0b", 4)), IResult(EResult::InvalidArgument));
  EXPECT_EQ(make("Cap", folder.Path()), IResult(EResult::Failed));
  EXPECT_EQ(make("Cap", Template("<SmartCluster label=\"A\" type=\"Toaster\"/>")), IResult(EResult::Failed));
  EXPECT_THAT(log.messages.back(), HasSubstr("object.sot: there is no device type \"Toaster\""));
  EXPECT_EQ(make("Cap", Template("<Cluster/>")), IResult(EResult::Failed));
  EXPECT_THAT(log.messages.back(), HasSubstr("object.sot:1:"));
  EXPECT_EQ(archive.commits, commits);
  archive.full = true;
  EXPECT_EQ(make("Cap", Template("<SmartCluster label=\"A\" type=\"Corvex1\"/>")), IResult(EResult::DiskFull));
  EXPECT_EQ(store->Reader()->FindByName("Cap", id), IResult(EResult::NotFound));
}

TEST_F(SmartObjectControlsTest, PatternsAreKeptWhereTheyCanBeAndTheSetIsTheSmallestThatHasEnough)
{
  AddObject("One", {Cluster(3), Cluster(3), Cluster(0), Cluster(60)});
  AddObject("Two", {Cluster(1)});
  EXPECT_TRUE(controls->AssignOptimalPatterns().Succeeded());
  EXPECT_THAT(Patterns(), ElementsAre(3, 2, 4, 5, 1));
  const int commits = archive.commits;
  EXPECT_TRUE(controls->AssignOptimalPatterns().Succeeded());
  EXPECT_EQ(archive.commits, commits) << "nothing to do";
  EXPECT_EQ(controls->CheckPattern(*store->Reader(), "Corvex1", 8), IResult(EResult::Ok));
  EXPECT_EQ(controls->CheckPattern(*store->Reader(), "Corvex1", 9), IResult(EResult::InvalidValue));

  AddObject("Three", std::vector<NMX::SmartCluster>(4, Cluster(0)));
  EXPECT_TRUE(controls->AssignOptimalPatterns().Succeeded());
  EXPECT_THAT(Patterns(), ElementsAre(3, 2, 4, 5, 1, 6, 7, 8, 9));
  EXPECT_EQ(SmartObjects::CurrentPatternSet(*store->Reader(), "Corvex1"), 16U);
  EXPECT_EQ(SmartObjects::CurrentPatternSet(*store->Reader(), "Quarex10"), 8U);

  AddObject("Crowd", std::vector<NMX::SmartCluster>(100, Cluster(0)));
  EXPECT_TRUE(controls->AssignOptimalPatterns().Succeeded());
  const auto patterns = Patterns();
  EXPECT_EQ(std::count(patterns.begin(), patterns.end(), 0U), 109 - 64);
  EXPECT_EQ(std::set<std::uint32_t>(patterns.begin(), patterns.end()).size(), 65U);
  EXPECT_EQ(patterns[108], 0U);

  AddObject("Other", {Cluster(0, "Quarex10")});
  EXPECT_EQ(controls->AssignOptimalPatterns(), IResult(EResult::NotSupported));
  AddObject("Strange", {Cluster(0, "Toaster")});
  EXPECT_EQ(controls->AssignOptimalPatterns(), IResult(EResult::NotFound));
}

TEST_F(SmartObjectControlsTest, MakesAnObjectForEachUnlinkedDeviceOrForNone)
{
  const LogCapture log;
  std::vector<std::string> names{"untouched"};
  EXPECT_TRUE(controls->CreateForUnlinkedDevices(names).Succeeded());
  AddObject("Torch", {Cluster(1, "Corvex1", "urn:1")});
  AddObject("urn-3", {Cluster(2)});
  for (const char* urn : {"urn:1", "urn:2", "urn-3", "urn-4"})
    AddDevice(urn, "Corvex1");
  const int commits = archive.commits;
  EXPECT_TRUE(controls->CreateForUnlinkedDevices(names).Succeeded());
  // A name that is taken, or that no subject can have, gives way to another.
  EXPECT_THAT(names, testing::UnorderedElementsAre("urn-4", "Corvex1 1", "Corvex1 2"));
  EXPECT_THAT(Patterns(), ElementsAre(1, 2, 3, 4, 5));
  EXPECT_EQ(archive.commits, commits + 1);

  AddDevice("odd", "Quarex10");
  AddDevice("plain", "Corvex1");
  EXPECT_EQ(controls->CreateForUnlinkedDevices(names), IResult(EResult::NotFound));
  EXPECT_EQ(Patterns().size(), 5U);
  AddObject("Linked", {Cluster(0, "Quarex10", "odd")});
  EXPECT_EQ(controls->CreateForUnlinkedDevices(names), IResult(EResult::NotSupported));
  EXPECT_EQ(Patterns().size(), 6U);
}

TEST_F(SmartObjectControlsTest, MoreDevicesThanPatternsAreTooMany)
{
  std::vector<std::string> names;
  AddObject("Torch", {Cluster(64)});
  for (int i = 0; i < 64; ++i)
    AddDevice("urn-" + std::to_string(i), "Corvex1");
  EXPECT_EQ(controls->CreateForUnlinkedDevices(names), IResult(EResult::AllocationFailure));
  EXPECT_EQ(Patterns().size(), 1U);
  const auto editor = store->Editor();
  EXPECT_TRUE(editor->SetApplicationEntry(NMX::EntryPath("Application/Devices/urn-0/Type"), {}).Succeeded());
  EXPECT_TRUE(editor->Commit().Succeeded());
  EXPECT_TRUE(controls->CreateForUnlinkedDevices(names).Succeeded());
  const auto patterns = Patterns();
  EXPECT_EQ(std::set<std::uint32_t>(patterns.begin(), patterns.end()).size(), 64U);
  EXPECT_EQ(std::count(patterns.begin(), patterns.end(), 0U), 0);
  EXPECT_EQ(patterns.front(), 64U) << "it could keep its own";
}

TEST_F(SmartObjectControlsTest, AutomaticManagementAssignsWhileItIsOnAndComesToRest)
{
  const auto postal = std::make_shared<ManualPostal>();
  auto management = SmartObjects::ManagePatterns(store, controls, postal);
  AddObject("One", {Cluster(0), Cluster(0)});
  postal->RunAll();
  EXPECT_THAT(Patterns(), ElementsAre(0, 0)) << "it is off";
  const auto set = [&](bool enabled)
  {
    const auto editor = store->Editor();
    EXPECT_TRUE(editor->SetApplicationEntry(Paths::AutoPatternManagement(), enabled).Succeeded());
    EXPECT_TRUE(editor->Commit().Succeeded());
  };
  set(true);
  EXPECT_LT(postal->RunAll(), 10);
  EXPECT_THAT(Patterns(), ElementsAre(1, 2));
  AddObject("Two", {Cluster(2)});
  EXPECT_LT(postal->RunAll(), 10);
  EXPECT_THAT(Patterns(), ElementsAre(1, 2, 3));
  set(false);
  AddObject("Three", {Cluster(1)});
  postal->RunAll();
  EXPECT_THAT(Patterns(), ElementsAre(1, 2, 3, 1));
  set(true);
  management.reset();
  postal->RunAll();
  EXPECT_THAT(Patterns(), ElementsAre(1, 2, 3, 1)) << "nobody manages any more";
}
