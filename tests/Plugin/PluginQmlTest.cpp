#include "HostInterface/RunaCorePluginInterface/IQmlContext.h"
#include "HostInterface/RunaCorePluginInterface/IUserInterface.h"
#include "HostInterface/VRigidObjectManagerQML.h"
#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"
#include "StandaloneHost/PluginModule.h"
#include "StandaloneHost/SmartObjects/VSmartObjectControls.h"
#include "StandaloneHost/VPluginHost.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"

#include <QCoreApplication>
#include <QQmlComponent>
#include <QQmlContext>
#include <QQmlEngine>

#include <gmock/gmock.h>

// What a host has of these is its own business.
class ISubjectOriginTools
{
};
class IRigidObjectControls
{
};

namespace
{

struct Context : RunaCorePluginInterface::IQmlContext
{
  QQmlEngine& Engine() const override { return engine; }
  QQmlContext& RootContext() const override { return *engine.rootContext(); }
  mutable QQmlEngine engine;
};

struct Menus : RunaCorePluginInterface::IUserInterface
{
  std::uint32_t ThemeColour(std::string_view) const override { return 0xFF123456; }
  void AddCommand(RunaCorePluginInterface::MenuCommand added) override { commands.push_back(std::move(added)); }
  std::vector<RunaCorePluginInterface::MenuCommand> commands;
};

/// The standalone host's settings, with controls of rigid objects.
struct RigidSettings : RunaCorePluginInterface::IPluginSettings
{
  void Features(std::shared_ptr<RunaCorePluginInterface::IFeatures>& out) const override { own->Features(out); }
  void FileLocations(std::shared_ptr<IFileLocations>& out) const override { own->FileLocations(out); }
  void SmartObjectControls(std::shared_ptr<ISmartObjectControls>& out) const override { own->SmartObjectControls(out); }
  void RigidObjectControls(std::shared_ptr<IRigidObjectControls>& out) const override { out = rigid; }
  void ObjectEvaluationSettings(std::shared_ptr<RunaCorePluginInterface::IObjectEvaluationSettings>& out) const override
  {
    own->ObjectEvaluationSettings(out);
  }
  void CharacterControls(std::shared_ptr<ICharacterControls>& out) const override { own->CharacterControls(out); }

  std::unique_ptr<VPluginSettings> own = std::make_unique<VPluginSettings>(0xFFFFFFFF);
  std::shared_ptr<IRigidObjectControls> rigid;
};

class PluginQmlTest : public StoreFixture
{
protected:
  ~PluginQmlTest() override { VRigidObjectManagerQML::UnregisterSingletonQML(); }

  HostServices Services()
  {
    HostServices services;
    services.store = store;
    services.guiPostal = gui;
    services.settings = settings;
    return services;
  }

  int argumentCount = 0;
  QCoreApplication application{argumentCount, nullptr};
  const std::shared_ptr<ManualPostal> gui = std::make_shared<ManualPostal>();
  const std::shared_ptr<RigidSettings> settings = std::make_shared<RigidSettings>();
  PluginPointer plugin = LoadPlugin(SUBJECT_STORE_PLUGIN_FILE);
};

}

TEST_F(PluginQmlTest, ThePanelsObjectsArePublishedUnderTheirNames)
{
  {
    Context context;
    VPluginHost host(Services());
    EXPECT_TRUE(plugin->RegisterQml(host, context));
    for (const char* name : {"rootContextSubjectStore", "rootContextSubjectPanel", "rootContextSubjectStoreOffline",
                             "SubjectStoreOffline"})
      EXPECT_NE(context.RootContext().contextProperty(name).value<QObject*>(), nullptr) << name;
    QQmlComponent component(&context.engine);
    component.setData(
        "import QtQml\nimport Tavix.SubjectStore 1.0\nQtObject { property bool ok: SubjectStore.subjects() "
        "!== undefined && SubjectStoreOffline !== null && SubjectRole.Solving === 1 }",
        {});
    const std::unique_ptr<QObject> object(component.create());
    ASSERT_TRUE(object) << component.errorString().toStdString();
    EXPECT_TRUE(object->property("ok").toBool());
  }
  // Again in an engine of its own, as when the host opens another window; the objects are those of the last.
  Context second;
  VPluginHost host(Services());
  EXPECT_TRUE(plugin->RegisterQml(host, second));
  plugin->UnregisterQml();

  Context third;
  const LogCapture log;
  VPluginHost nothing({});
  EXPECT_FALSE(plugin->RegisterQml(nothing, third));
  EXPECT_EQ(log.messages.size(), 1U);
}

TEST_F(PluginQmlTest, TheRigidObjectManagerIsRegisteredOnceAndOnlyByWhoHasItsTools)
{
  Context context;
  VPluginHost host(Services());
  EXPECT_TRUE(plugin->RegisterQml(host, context));
  EXPECT_FALSE(VRigidObjectManagerQML::IsRegistered()) << "the host has no tools for it";

  const auto tools = std::make_shared<ISubjectOriginTools>();
  const auto ofHost = std::make_shared<IRigidObjectControls>();
  const auto registerAsHost = [&]
  {
    VRigidObjectManagerQML::RegisterSingletonQML(gui, store, nullptr, nullptr, nullptr, tools, nullptr, ofHost,
                                                 "Tavix.RunaCore.RigidObjectManager", "RigidObjectManager");
  };
  registerAsHost();
  EXPECT_EQ(ofHost.use_count(), 2);
  registerAsHost();
  EXPECT_TRUE(plugin->RegisterQml(host, context));
  EXPECT_EQ(ofHost.use_count(), 2) << "it is what it was";
  QQmlComponent component(&context.engine);
  component.setData("import QtQml\nimport Tavix.RunaCore.RigidObjectManager 1.0\nQtObject { property bool ok: "
                    "RigidObjectManager.isAvailable() }",
                    {});
  const std::unique_ptr<QObject> object(component.create());
  ASSERT_TRUE(object) << component.errorString().toStdString();
  EXPECT_TRUE(object->property("ok").toBool());
  plugin->UnregisterQml();
  EXPECT_FALSE(VRigidObjectManagerQML::IsRegistered());
  EXPECT_EQ(ofHost.use_count(), 1) << "the services are free";
}

TEST_F(PluginQmlTest, TheMenuCommandSaysWhyItCannotBeTriggered)
{
  Menus menus;
  const auto trigger = [&](const std::shared_ptr<ISmartObjectControls>& controls)
  {
    settings->own = std::make_unique<VPluginSettings>(0xFFFFFFFF, HostSettings{nullptr, controls, nullptr, nullptr});
    VPluginHost host(Services());
    menus.commands.clear();
    EXPECT_TRUE(plugin->RegisterUserInterface(host, menus));
    std::string reason;
    return menus.commands.at(0).possible(reason) ? std::string("possible") : reason;
  };
  EXPECT_EQ(trigger(nullptr), "This host has no active markers.");
  EXPECT_EQ(menus.commands[0].menu, "&Edit");
  EXPECT_EQ(menus.commands[0].text, "Assign &Smart Object Patterns");
  std::string reason;
  EXPECT_EQ(menus.commands[0].trigger(reason), NMX::IResult(NMX::EResult::NotAvailable));
  EXPECT_FALSE(reason.empty());

  const auto layouts = std::make_shared<SmartObjects::DeviceLayouts>();
  const auto controls = std::make_shared<SmartObjects::VSmartObjectControls>(store, layouts);
  EXPECT_EQ(trigger(controls), "There are no smart objects.");
  const Id glove = Add(NMX::ESubjectKind::SmartObjects, "Glove");
  Set(glove, NMX::Paths::SmartClusters(), std::vector<NMX::SmartCluster>{{"Palm", "", 0, "Corvex1"}});
  EXPECT_EQ(trigger(controls), "possible");
  EXPECT_EQ(menus.commands[0].trigger(reason), NMX::IResult(NMX::EResult::NotFound));
  EXPECT_EQ(reason, "A cluster is of a type that is not known here.");
  SmartObjectServices::RegisterDeviceTypes(*layouts);
  EXPECT_TRUE(menus.commands[0].trigger(reason).Succeeded());
  EXPECT_NE(Get<std::vector<NMX::SmartCluster>>(glove, NMX::Paths::SmartClusters())[0].pattern, 0U);
}
