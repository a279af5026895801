#include "StandaloneHost/FileIO/VRunaCoreFileIO.h"
#include "StandaloneHost/Panel/VObjectPresetProvider.h"
#include "StandaloneHost/Panel/VOfflineStoreServices.h"
#include "StandaloneHost/Panel/VPanelServices.h"
#include "StandaloneHost/Panel/VSelectionManager.h"
#include "StandaloneHost/VPluginHost.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"

#include <gmock/gmock.h>

using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using testing::ElementsAre;
namespace Paths = NMX::Paths;

namespace
{

SelectionItem Subject(unsigned id, int slot = -1)
{
  return {NMX::TSubjectStoreId(id), slot, ""};
}

TEST(SelectionManager, KeepsTheOrderAndEachThingOnce)
{
  Panel::VSelectionManager selection;
  const SelectionItem device{{}, -1, "urn"};
  selection.Select({Subject(3), Subject(1), Subject(3, 0), device, Subject(1), device, Subject(3)});
  EXPECT_THAT(selection.Selection(), ElementsAre(Subject(3), Subject(1), Subject(3, 0), device));
}

TEST(SelectionManager, TellsOfEachChangeWithinSelect)
{
  Panel::VSelectionManager selection;
  std::vector<std::size_t> told;
  auto first = selection.OnChange([&] { told.push_back(selection.Selection().size()); });
  selection.Select({Subject(1)});
  selection.Select({Subject(1), Subject(1)});
  EXPECT_THAT(told, ElementsAre(1U)) << "the same again is no change";
  selection.Select({Subject(2), Subject(1)});
  selection.Select({Subject(1), Subject(2)});
  EXPECT_THAT(told, ElementsAre(1U, 2U, 2U)) << "another order is";

  // A handler that ends a later subscription, begins one, and selects.
  told.clear();
  NMX::Subscription second;
  NMX::Subscription third;
  int late = 0;
  const auto busy = selection.OnChange(
      [&]
      {
        second.reset();
        if (!third)
          third = selection.OnChange([&] { ++late; });
        selection.Select({});
      });
  second = selection.OnChange([] { ADD_FAILURE() << "its subscription has ended"; });
  selection.Select({Subject(5)});
  EXPECT_THAT(told, ElementsAre(1U, 0U));
  EXPECT_EQ(late, 1) << "only the change that came after it";
  EXPECT_TRUE(selection.Selection().empty());

  first.reset();
  told.clear();
  selection.Select({Subject(6)});
  EXPECT_TRUE(told.empty());
}

class PresetProviderTest : public StoreFixture
{
protected:
  void SetUp() override
  {
    SetApplication("Application/ObjectPresets/7/Name", std::string("Hand prop"));
    SetApplication("Application/ObjectPresets/7/ReadOnly", true);
    SetApplication("Application/ObjectPresets/7/Parameters/ColourRGBA", colour);
    SetApplication("Application/ObjectPresets/7/Parameters/Enabled", false);
    SetApplication("Application/ObjectPresets/7/Parameters/FilePath", std::wstring(L"a.obj"));
    SetApplication("Application/ObjectPresets/7/Parameters/PresetName", std::string("another"));
    SetApplication("Application/ObjectPresets/77/Name", std::string("Plain"));
    SetApplication("Application/ObjectPresets/8/Parameters/Enabled", false);
    SetApplication("Application/ObjectPresets/9/Name", std::string("Broken"));
    SetApplication("Application/ObjectPresets/9/Parameters/Enabled", 1U);
  }

  IResult Apply(unsigned preset, Id subject)
  {
    const auto editor = store->Editor();
    const IResult applied = provider.Apply(*editor, Id(preset), subject);
    return applied.Failed() ? applied : editor->Commit();
  }

  const NMX::Colour colour{1, 2, 3, 4};
  Panel::VObjectPresetProvider provider;
};

TEST_F(PresetProviderTest, GivesAnObjectTheParametersThatItHas)
{
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  const Id belt = Add(ESubjectKind::SmartObjects, "Belt");
  for (const Id id : {crate, belt})
  {
    ASSERT_EQ(Apply(7, id), IResult(EResult::Ok));
    EXPECT_EQ(Get<NMX::Colour>(id, Paths::ColourRGBA()), colour);
    EXPECT_FALSE(Get<bool>(id, Paths::Enabled()));
    EXPECT_EQ(Get<std::string>(id, Paths::PresetName()), "Hand prop");
  }
  EXPECT_EQ(Get<std::wstring>(crate, Paths::FilePath()), L"a.obj");
  EXPECT_EQ(Apply(77, crate), IResult(EResult::Ok));
  EXPECT_EQ(Get<std::string>(crate, Paths::PresetName()), "Plain");
  EXPECT_EQ(Get<NMX::Colour>(crate, Paths::ColourRGBA()), colour) << "the other preset's parameters stay";
}

TEST_F(PresetProviderTest, RefusesWhatItCannotApply)
{
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  EXPECT_EQ(Apply(6, crate), IResult(EResult::NotFound));
  EXPECT_EQ(Apply(8, crate), IResult(EResult::NotFound)) << "it has no name";
  EXPECT_EQ(Apply(0, crate), IResult(EResult::NotFound));
  EXPECT_EQ(Apply(7, Id(1000)), IResult(EResult::InvalidId));
  EXPECT_EQ(Apply(7, Add(ESubjectKind::LabellingClusters, "Cluster")), IResult(EResult::InvalidType));
  EXPECT_EQ(Apply(9, crate), IResult(EResult::InvalidType)) << "a value of another type";
  EXPECT_EQ(Get<std::string>(crate, Paths::PresetName()), "");
}

TEST_F(StoreFixture, TheHostHandsOutWhatThePanelNeeds)
{
  const auto gui = std::make_shared<ManualPostal>();
  HostServices services;
  services.guiPostal = gui;
  services.selection = std::make_shared<Panel::VSelectionManager>();
  services.objectPresets = std::make_shared<Panel::VObjectPresetProvider>();
  services.offlineStore = std::make_shared<Panel::VOfflineStoreServices>(store, gui);
  services.panel = std::make_shared<Panel::VPanelServices>(
      Panel::ServicesForPanel{.fileIO = std::make_shared<FileIO::VRunaCoreFileIO>(store)});
  const VPluginHost host(services);
  std::shared_ptr<NMX::IPostalService> postal;
  std::shared_ptr<ISelectionManager> selection;
  std::shared_ptr<RunaCorePluginInterface::IObjectPresetProvider> presets;
  std::shared_ptr<RunaCorePluginInterface::IOfflineStoreServices> offline;
  std::shared_ptr<NMX::IStore> offlineStore;
  host.PostalService(postal);
  host.SelectionManager(selection);
  host.ObjectPresetProvider(presets);
  host.OfflineStoreServices(offline);
  EXPECT_TRUE(postal == gui && selection == services.selection && presets == services.objectPresets);
  ASSERT_TRUE(offline == services.offlineStore);
  offline->Store(offlineStore);
  EXPECT_EQ(offlineStore, store);
  std::shared_ptr<RunaCorePluginInterface::IPanelServices> panel;
  std::shared_ptr<IRunaCoreFileIO> fileIO;
  host.PanelServices(panel);
  ASSERT_TRUE(panel == services.panel);
  panel->FileIO(fileIO);
  ASSERT_NE(fileIO, nullptr);
  // A service that the host does not have takes away what was in the argument.
  host.FileIO(fileIO);
  EXPECT_EQ(fileIO, nullptr);
}

}
