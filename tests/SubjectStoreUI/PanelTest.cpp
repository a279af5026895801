#include "HostInterface/IFileLocations.h"
#include "HostInterface/IRunaCoreFileIO.h"
#include "HostInterface/RunaCorePluginInterface/IPluginSettings.h"
#include "StandaloneHost/Calibration/VCalibrationProvider.h"
#include "StandaloneHost/Panel/VPanelServices.h"
#include "StandaloneHost/Panel/VSelectionManager.h"
#include "StandaloneHost/Settings/PanelSettings.h"
#include "StandaloneHost/Simulation/VDeviceServices.h"
#include "StandaloneHost/SmartObjects/VSmartObjectControls.h"
#include "StoreInterface/SettingsPaths.h"
#include "StoreUI/VStoreParameterModel.h"
#include "SubjectStoreUI/QmlRegistration.h"
#include "SubjectStoreUI/VCalibrationScalingQml.h"
#include "SubjectStoreUI/VDeviceModel.h"
#include "SubjectStoreUI/VPanelRowsModel.h"
#include "SubjectStoreUI/VSubjectPanelQml.h"
#include "SubjectStoreUI/VSubjectStoreQml.h"
#include "tests/Support/Eventually.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualAsioPostal.h"
#include "tests/Support/ModelFixture.h"
#include "tests/Support/ModelShadow.h"
#include "tests/Support/TemporaryFolder.h"

#include <QMetaMethod>
#include <QQmlComponent>
#include <QQmlContext>
#include <QQmlEngine>
#include <QThread>

#include <gmock/gmock.h>

#include <sys/resource.h>

#include <csignal>
#include <fstream>

using namespace SubjectStoreUI;
using NMX::EResult;
using NMX::ESubjectKind;
using NMX::IResult;
using testing::_;
using testing::DoAll;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Return;
using testing::SetArgReferee;
namespace Paths = NMX::Paths;

namespace
{

class MockFileIO : public IRunaCoreFileIO
{
public:
  MOCK_METHOD(IResult, LoadSubjectConfiguration, (const std::wstring&, std::string&), (override));
  MOCK_METHOD(IResult, SaveSubjectConfiguration, (const std::wstring&, std::string&), (override));
  MOCK_METHOD(IResult, ImportSubject, (const std::wstring&, bool, std::string&), (override));
  MOCK_METHOD(IResult, ImportMesh, (const std::wstring&, std::string&), (override));
  MOCK_METHOD(IResult, ExportSubject, (NMX::TSubjectStoreId, const std::wstring&, std::string&), (override));
  MOCK_METHOD(IResult, ExportTemplate, (NMX::TSubjectStoreId, const std::wstring&, std::string&), (override));
};

struct OneFolder : IFileLocations
{
  std::vector<std::wstring> Directories(std::uint32_t location) const override
  {
    return location == smartObjectTemplates ? std::vector{shipped, user} : std::vector<std::wstring>{};
  }
  std::wstring UserDirectory(std::uint32_t location) const override
  {
    return location == smartObjectTemplates ? user : std::wstring{};
  }
  std::wstring shipped;
  std::wstring user;
};

struct Features : RunaCorePluginInterface::IFeatures
{
  explicit Features(std::uint32_t bits) : mask(bits) {}
  std::uint32_t Mask() const override { return mask; }
  const std::uint32_t mask;
};

class PanelTest : public ModelFixture
{
protected:
  PanelTest()
  {
    services.fileIO = fileIO;
    services.fileLocations = locations;
    services.smartObjects =
        std::make_shared<SmartObjects::VSmartObjectControls>(store, std::make_shared<SmartObjects::DeviceLayouts>());
    services.devices = std::make_shared<Simulation::VDeviceServices>(store, timers);
    locations->shipped =
        (std::filesystem::path(SUBJECT_STORE_SOURCE_DIR) / "StandaloneHost/SmartObjects/Templates").wstring();
    locations->user = (folder.Path() / "user").wstring();
  }

  /// The panel's object, in a host with these features.
  VSubjectStoreQml& MakePanel(std::uint32_t mask = 0xFFFFFFFF, QQmlContext* context = nullptr)
  {
    services.features = std::make_shared<Features>(mask);
    m_panel = std::make_unique<VSubjectStoreQml>(context, selection, std::make_shared<Panel::VPanelServices>(services),
                                                 gui, store);
    return *m_panel;
  }

  /// Lets be told what is to be told, until something holds.
  template <class Condition>
  void WaitUntil(Condition condition)
  {
    const auto step = [this]
    {
      gui->RunAll();
      QCoreApplication::processEvents(QEventLoop::AllEvents, 20);
      QThread::msleep(1);
    };
    EXPECT_TRUE(Eventually(condition, step));
  }

  static VStoreIdGadget Gadget(Id id) { return VStoreIdGadget(id); }
  static QVariantList List(std::initializer_list<Id> ids)
  {
    QVariantList list;
    for (const Id id : ids)
      list.append(QVariant::fromValue(VStoreIdGadget(id)));
    return list;
  }
  static QVariantList Devices(std::initializer_list<const char*> urns)
  {
    QVariantList list;
    for (const char* urn : urns)
      list.append(QVariant::fromValue(VSelectionItemGadget(SelectionItem{{}, -1, urn})));
    return list;
  }

  const TemporaryFolder folder;
  const std::shared_ptr<ManualAsioPostal> timers = std::make_shared<ManualAsioPostal>();
  const std::shared_ptr<Panel::VSelectionManager> selection = std::make_shared<Panel::VSelectionManager>();
  const std::shared_ptr<MockFileIO> fileIO = std::make_shared<testing::StrictMock<MockFileIO>>();
  const std::shared_ptr<OneFolder> locations = std::make_shared<OneFolder>();
  Panel::ServicesForPanel services;

private:
  std::unique_ptr<VSubjectStoreQml> m_panel;
};

}

TEST_F(PanelTest, QmlFindsPropertiesAndOperationsByTheNamesThatItUses)
{
  const QMetaObject& meta = VSubjectStoreQml::staticMetaObject;
  Names properties;
  for (int i = meta.propertyOffset(); i < meta.propertyCount(); ++i)
    properties.push_back(std::string(meta.property(i).name()) + " " + meta.property(i).typeName());
  EXPECT_THAT(properties, ElementsAre("subjectWarnings QVariantList", "objectEvaluationProgressDone double",
                                      "objectEvaluationProgressRequired double", "subjectTypeModels QList<QObject*>",
                                      "subjectSetupParameterModel QAbstractItemModel*",
                                      "selectedSubjectParameterModel QAbstractItemModel*",
                                      "objectPresetModel QAbstractItemModel*"));
  std::map<QMetaMethod::MethodType, Names> methods;
  for (int i = meta.methodOffset(); i < meta.methodCount(); ++i)
  {
    std::string text = meta.method(i).name().toStdString();
    for (const QByteArray& parameter : meta.method(i).parameterNames())
      text += ' ' + parameter.toStdString();
    methods[meta.method(i).methodType()].push_back(text);
  }
  EXPECT_THAT(methods[QMetaMethod::Signal],
              ElementsAre("subjectWarningsChanged", "objectEvaluationProgressChanged", "focusSubject subjectStoreId"));
  EXPECT_EQ(methods[QMetaMethod::Method],
            Names({"enabledFeatures",
                   "subjectStoreIdsBySelectionItems i_SubjectSelectionItems",
                   "subjects",
                   "subjectNameRegex",
                   "isSubjectNameInUse i_SubjectName",
                   "subjectName i_SubjectStoreId",
                   "setSubjectName i_SubjectStoreId i_Name",
                   "subjectFlags i_SubjectStoreId",
                   "subjectCalibration i_SubjectStoreId",
                   "subjectEnabled i_SubjectStoreId",
                   "setSubjectsEnabled i_SubjectStoreIds i_bEnabled",
                   "toggleSubjectsEnabled i_SubjectStoreIds",
                   "rebootSubjects i_SubjectStoreIds",
                   "removeSubjects i_SubjectStoreIds i_bRemoveChildren",
                   "smartClusterCount i_SubjectStoreId",
                   "smartClusterLabel i_SubjectStoreId i_SmartClusterIndex",
                   "loadSubjectConfiguration i_FilePath",
                   "saveSubjectConfiguration i_FilePath",
                   "importSubject i_FilePath i_bOverwrite",
                   "importMesh i_FilePath",
                   "exportSubject i_SubjectStoreId i_FilePath",
                   "exportTemplate i_SubjectStoreId i_FilePath",
                   "canCreateSmartObjects i_SelectionItems",
                   "createSmartObjects i_SelectionItems",
                   "assignOptimalActiveMarkerPatterns i_SelectionItems",
                   "canMergeSelectedSmartObjects i_SelectionItems",
                   "mergeSelectedSmartObjects i_SelectionItems",
                   "canSplitSelectedSmartObjects i_SelectionItems",
                   "splitSelectedSmartObjects i_SelectionItems",
                   "canSwapSmartClusters i_FirstSubjectId i_SecondSubjectId",
                   "swapSmartClusters i_FirstSubjectId i_SecondSubjectId i_FirstClusterIndex i_SecondClusterIndex",
                   "calibrateCFC i_SubjectStoreIds",
                   "decalibrateCFC i_SubjectStoreIds",
                   "canAssignSubjectToSlot i_SubjectStoreId i_EmptySubjectSlotSelectionItem",
                   "assignSubjectToSlot i_SubjectStoreId i_EmptySubjectSlotSelectionItem",
                   "canUnassignSubjects i_SubjectStoreIds",
                   "unassignSubjects i_SubjectStoreIds",
                   "anySubjectManuallyAssignable",
                   "canDetachClusters i_SubjectStoreIds",
                   "detachClusters i_SubjectStoreIds",
                   "addModel i_ModelName",
                   "removeModel i_ModelName",
                   "createCalibrationScalingOperation",
                   "Paths i_Type",
                   "copyFileToUserFolder i_FilePath i_SubjectFileType"}));
  const QMetaEnum types = meta.enumerator(meta.enumeratorOffset());
  EXPECT_STREQ(types.name(), "ESubjectFileType");
  EXPECT_EQ(types.keyCount(), 15);
  EXPECT_STREQ(types.valueToKey(14), "EExportFile");
}

TEST_F(PanelTest, TheModuleHasItsConstantsWhichQmlCannotChange)
{
  RegisterModule();
  RegisterModule();
  QQmlEngine engine;
  AddModuleFiles(engine);
  QQmlContext& root = *engine.rootContext();
  MakePanel(0xFFFFFFFF, &root);
  Add(ESubjectKind::BasicObjects, "Crate");
  const auto evaluate = [&](const char* expression)
  {
    QQmlComponent component(&engine);
    component.setData((std::string("import QtQml\nimport Tavix.SubjectStore 1.0\nQtObject { property var value: ") +
                       expression + " }")
                          .c_str(),
                      {});
    const std::unique_ptr<QObject> object(component.create());
    EXPECT_TRUE(object) << component.errorString().toStdString();
    return object ? object->property("value").toString().toStdString() : std::string();
  };
  for (const auto& [expression, expected] : std::initializer_list<std::pair<const char*, const char*>>{
           {"SubjectRole.Retargeting", "2"},
           {"SubjectFlags.Markerless", "512"},
           {"SubjectCalibration.Calibrated", "2"},
           {"SubjectStoreFeatures.ModelOutput", "262144"},
           {"SubjectWarning.WarningActiveMarkersOff", "20"},
           {"SubjectWarning.Warnings", "0"},
           {"SubjectWarning.WarningDuplicateDevice", "1"},
           {"SubjectsModelRole.SubjectStoreId", "257"},
           {"SubjectsModelRole.SubjectIsSubjectElement", "278"},
           {"StoreObjectPresetModel.ReadOnlyRole", "259"},
           {"{ try { SubjectFlags.Smart = 5 } catch (error) {}; return SubjectFlags.Smart }", "2"},
           {"{ try { SubjectFlags.Extra = 5 } catch (error) {}; return String(SubjectFlags.Extra) }", "undefined"},
           {"SubjectStoreQml.ESubjectConfiguration", "9"},
           {"SubjectStore.subjectNameRegex().length > 0", "true"},
           {"SubjectStore.subjectTypeModels.length", "8"},
           {"SubjectStore.setSubjectName(SubjectStore.subjects()[0], 'Ada').name", "Ok"},
           {"SubjectStore.setSubjectName(SubjectStore.subjects()[0], '').reason", "A name is needed."},
           {"rootContextSubjectPanel.itemOf(SubjectStore.subjects()[0]).subject.equals(SubjectStore.subjects()[0])",
            "true"},
           {"SubjectStore.setSubjectsEnabled(SubjectStore.subjects(), false).failed", "false"}})
    EXPECT_EQ(evaluate(expression), expected) << expression;
  QQmlComponent made(&engine);
  made.setData("import Tavix.SubjectStore 1.0\nSubjectStoreQml {}", {});
  EXPECT_THAT(made.errorString().toStdString(), testing::HasSubstr("SubjectStoreQml can only be created from c++."));
}

TEST_F(PanelTest, EachFeatureHasItsSections)
{
  for (const auto& [mask, expected] : std::initializer_list<std::pair<std::uint32_t, Names>>{
           {0, {}},
           {1, {"Basic objects"}},
           {2 | 4, {"Characters", "Smart objects"}},
           {0x5038, {"Subjects", "Labelling clusters", "Markerless", "Props", "Scene meshes"}}})
  {
    Names headings;
    for (QObject* section : MakePanel(mask).subjectTypeModels())
      headings.push_back(section->property("typeDisplayName").toString().toStdString());
    EXPECT_EQ(headings, expected);
    EXPECT_EQ(MakePanel(mask).objectPresetModel(), nullptr);
  }
  EXPECT_NE(MakePanel(0x40).objectPresetModel(), nullptr);
  EXPECT_EQ(MakePanel(0x41).enabledFeatures(), 0x41U);
}

TEST_F(PanelTest, ElementsAreBackAfterTheStoreWasEmpty)
{
  auto& section = *qobject_cast<VSortSubjectsProxyModel*>(MakePanel(1).subjectTypeModels().value(0));
  for (const char* name : {"Crate", "Box"})
  {
    const Id id = Add(ESubjectKind::BasicObjects, name);
    Set(id, Paths::Markers(), std::vector<NMX::Position>{{1, 2, 3}});
    WaitUntil([&] { return NamesBeneath(section, section.index(0, 0)) == Names{"Marker 1"}; });
    Remove(id);
    WaitUntil([&] { return section.rowCount() == 0; });
  }
}

TEST_F(PanelTest, AnEditOfSeveralSubjectsIsAllOrNothing)
{
  VSubjectStoreQml& panel = MakePanel();
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  const Id glove = Add(ESubjectKind::SmartObjects, "Glove");
  Set(glove, Paths::Enabled(), false);
  EXPECT_FALSE(panel.toggleSubjectsEnabled(List({crate, glove, crate})).Failed());
  EXPECT_FALSE(panel.subjectEnabled(Gadget(crate)));
  EXPECT_TRUE(panel.subjectEnabled(Gadget(glove)));
  const VResultGadget gone = panel.setSubjectsEnabled(List({crate, Id(999)}), true);
  EXPECT_EQ(gone.Name(), "InvalidId");
  EXPECT_EQ(gone.Reason(), "It is no longer there.");
  EXPECT_FALSE(panel.subjectEnabled(Gadget(crate)));
  EXPECT_EQ(panel.setSubjectsEnabled({1, "x", QVariant()}, true).Name(), "InvalidArgument");
  archive.full = true;
  EXPECT_EQ(panel.setSubjectsEnabled(List({crate}), true).Name(), "DiskFull");
  archive.full = false;
  EXPECT_FALSE(panel.subjectEnabled(Gadget(crate)));

  EXPECT_EQ(panel.setSubjectName(Gadget(crate), "Glove").Reason(), "A subject of that name exists already.");
  EXPECT_EQ(panel.setSubjectName(Gadget(crate), "a/b").Reason(), "A name cannot contain \"/\".");
  EXPECT_EQ(panel.setSubjectName(Gadget(crate), " a").Reason(), "A name cannot begin or end with a space.");
  EXPECT_EQ(panel.setSubjectName(Gadget(crate), "").Reason(), "A name is needed.");
  EXPECT_EQ(panel.setSubjectName(Gadget(crate), QString(300, 'x')).Reason(), "The name is too long.");
  EXPECT_FALSE(panel.setSubjectName(Gadget(crate), "Box").Failed());
  EXPECT_EQ(panel.subjectName(Gadget(crate)), "Box");

  const Id body = Add(ESubjectKind::GeneralSubjects, "Body");
  Set(crate, Paths::ParentSubjectId(), body);
  Set(glove, Paths::ParentSubjectId(), crate);
  EXPECT_FALSE(panel.removeSubjects(List({crate}), false).Failed());
  EXPECT_EQ(panel.subjects().size(), 2);
  Set(glove, Paths::ParentSubjectId(), body);
  EXPECT_FALSE(panel.removeSubjects(List({body, glove}), true).Failed());
  EXPECT_THAT(panel.subjects(), IsEmpty());
}

TEST_F(PanelTest, WhatIsOfferedForDevicesIsWhatIsAccepted)
{
  VSubjectStoreQml& panel = MakePanel();
  for (const char* urn : {"urn-1", "urn-2"})
    SetApplication(std::string("Application/Devices/") + urn + "/Type", std::string("Corvex1"));
  SetApplication("Application/Devices/urn-3/Type", std::string("Other"));
  const std::pair<QVariantList, const char*> refused[] = {
      {{}, "InvalidArgument"}, {Devices({"nobody"}), "NotFound"}, {Devices({"urn-1", "urn-3"}), "NotFound"}};
  for (const auto& [items, name] : refused)
  {
    EXPECT_FALSE(panel.canCreateSmartObjects(items));
    EXPECT_EQ(panel.createSmartObjects(items).Name(), name);
  }
  EXPECT_TRUE(panel.canCreateSmartObjects(Devices({"urn-2", "urn-1", "urn-2"})));
  EXPECT_THAT(panel.subjects(), IsEmpty()) << "asking makes nothing";
  EXPECT_FALSE(panel.createSmartObjects(Devices({"urn-2"})).Failed());
  EXPECT_FALSE(panel.canCreateSmartObjects(Devices({"urn-1", "urn-2"})));
  EXPECT_EQ(panel.createSmartObjects(Devices({"urn-1", "urn-2"})).Reason(),
            "A device is linked to a smart object already.");
  EXPECT_EQ(panel.subjects().size(), 1);
}

TEST_F(PanelTest, FilesAreThoseOfThisMachine)
{
  VSubjectStoreQml& panel = MakePanel();
  const QUrl local = QUrl::fromLocalFile("/tmp/a b \u00e9.xml");
  for (const char* url : {"", "http://example.com/a.xml", "qrc:/a.xml", "a.xml", "file:///a%00b.xml"})
  {
    EXPECT_EQ(panel.loadSubjectConfiguration(QUrl(url)).Name(), "InvalidName") << url;
    EXPECT_EQ(panel.exportSubject({}, QUrl(url)).Name(), "InvalidName") << url;
    EXPECT_EQ(panel.copyFileToUserFolder(QUrl(url), VSubjectStoreQml::ESmartObjectTemplate).Name(), "InvalidName");
  }
  const std::wstring path = L"/tmp/a b \u00e9.xml";
  MockFileIO& files = *fileIO;
  EXPECT_CALL(files, LoadSubjectConfiguration(path, _))
      .WillOnce(DoAll(SetArgReferee<1>("line 3 is wrong"), Return(EResult::SerialisationFailure)));
  const VResultGadget loaded = panel.loadSubjectConfiguration(local);
  EXPECT_EQ(loaded.Name(), "SerialisationFailure");
  EXPECT_EQ(loaded.Reason(), "line 3 is wrong");
  EXPECT_CALL(files, ImportSubject(path, true, _)).WillOnce(Return(EResult::OkButModified));
  EXPECT_EQ(panel.importSubject(local, true).Name(), "OkButModified");
  EXPECT_CALL(files, ImportMesh(path, _)).WillOnce(testing::Throw(std::runtime_error("x")));
  EXPECT_EQ(panel.importMesh(local).Name(), "FailedWithException");
  EXPECT_CALL(files, SaveSubjectConfiguration(path, _)).WillOnce(Return(EResult::DiskFull));
  const LogCapture log;
  EXPECT_EQ(panel.saveSubjectConfiguration(local).Reason(), "The disk is full.");
  EXPECT_THAT(log.messages, ElementsAre("Unable to save subject configuration: DiskFull"));
}

TEST_F(PanelTest, AFileIsCopiedToTheUsersFolderButNeverOverOne)
{
  VSubjectStoreQml& panel = MakePanel();
  const auto file = folder.Path() / "My template.sot";
  std::ofstream(file) << "first";
  const QUrl url = QUrl::fromLocalFile(QString::fromStdString(file.string()));
  const auto copy = [&](VSubjectStoreQml::ESubjectFileType type)
  { return panel.copyFileToUserFolder(url, type).Name(); };
  EXPECT_EQ(panel.Paths(VSubjectStoreQml::ESmartObjectTemplate).size(), 1);
  rlimit before{};
  ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &before), 0);
  const rlimit few{2, before.rlim_max};
  const auto handler = std::signal(SIGXFSZ, SIG_IGN);
  ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &few), 0);
  EXPECT_EQ(copy(VSubjectStoreQml::ESmartObjectTemplate), "FileIOFailure") << "it would be cut short";
  ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &before), 0);
  std::signal(SIGXFSZ, handler);
  EXPECT_TRUE(std::filesystem::is_empty(folder.Path() / "user"));
  const LogCapture log;
  EXPECT_EQ(copy(VSubjectStoreQml::ESmartObjectTemplate), "Ok");
  std::ofstream(file) << "second";
  EXPECT_EQ(copy(VSubjectStoreQml::ESmartObjectTemplate), "AlreadyPresent");
  EXPECT_EQ(copy(VSubjectStoreQml::EProp), "NotAvailable");
  EXPECT_EQ(copy(static_cast<VSubjectStoreQml::ESubjectFileType>(99)), "InvalidType");
  std::filesystem::remove(file);
  EXPECT_EQ(copy(VSubjectStoreQml::ESmartObjectTemplate), "FileNotFound");
  const std::string target = (folder.Path() / "user/My template.sot").string();
  EXPECT_THAT(
      log.messages,
      ElementsAre("Copied " + file.string() + " to " + target,
                  "Error copying " + file.string() + " to " + target + " : there is a file of that name already.",
                  "Error copying " + file.string() + " to " + target + " : there is no such file."));
  std::string kept;
  std::ifstream(target) >> kept;
  EXPECT_EQ(kept, "first");
  EXPECT_EQ(panel.Paths(VSubjectStoreQml::ESmartObjectTemplate).value(1).fileName(), "My template.sot");
  EXPECT_THAT(panel.Paths(static_cast<VSubjectStoreQml::ESubjectFileType>(-1)), IsEmpty());
}

TEST_F(PanelTest, ParametersAreThoseOfTheFirstSelectedSubjectAndAreEdited)
{
  VSubjectStoreQml& panel = MakePanel();
  QAbstractItemModel& model = *panel.selectedSubjectParameterModel();
  EXPECT_EQ(model.rowCount(), 0);
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  const Id body = Add(ESubjectKind::GeneralSubjects, "Body");
  selection->Select({{crate, -1, {}}, {body, -1, {}}});
  using Role = StoreUI::ParameterRole::ERole;
  const auto row = [&](const char* key)
  {
    for (int i = 0; i < model.rowCount(); ++i)
      if (model.index(i, 0).data(Role::Key) == key)
        return model.index(i, 0);
    return QModelIndex();
  };
  EXPECT_EQ(row("Parameters/Name").data(Role::Value), "Crate");
  EXPECT_FALSE(row("ModelOutputs/CGM2").isValid());
  const struct
  {
    const char* key;
    QVariant value;
    bool accepted;
  } edits[] = {{"Parameters/Name", "Body", false},          {"Parameters/Name", "Box", true},
               {"Parameters/Enabled", "no", false},         {"Parameters/Enabled", false, true},
               {"Parameters/ColourRGBA", "red", false},     {"Parameters/ColourRGBA", "#80ff0001", true},
               {"Parameters/EntranceThreshold", -1, false}, {"Parameters/EntranceThreshold", 1.5, false},
               {"Parameters/EntranceThreshold", 4, true},   {"Parameters/PresetName", "x", false}};
  for (const auto& [key, value, accepted] : edits)
  {
    const QVariant before = row(key).data(Role::Value);
    EXPECT_EQ(model.setData(row(key), value, Role::Value), accepted) << key;
    EXPECT_EQ(row(key).data(Role::Value), accepted ? value : before) << key;
  }
  EXPECT_EQ(Get<std::string>(crate, Paths::Name()), "Box");
  EXPECT_EQ(Get<NMX::Colour>(crate, Paths::ColourRGBA()), (NMX::Colour{255, 0, 1, 128}));
  EXPECT_FALSE(row("Parameters/Enabled").data(Role::Problem).isNull());
  selection->Select({{body, -1, {}}});
  EXPECT_EQ(row("ModelOutputs/CGM2").data(Role::Value), false);
  EXPECT_EQ(panel.addModel("CGM2").Name(), "Ok");
  EXPECT_TRUE(Get<bool>(body, Paths::ModelOutputCGM2()));
  EXPECT_EQ(panel.addModel("Other").Name(), "NotFound");
}

TEST_F(PanelTest, AnObjectIsScaledToWhatWasMeasured)
{
  VSubjectStoreQml& panel = MakePanel();
  const Id crate = Add(ESubjectKind::BasicObjects, "Crate");
  selection->Select({{crate, -1, {}}});
  EXPECT_EQ(panel.createCalibrationScalingOperation(), nullptr) << "no markers";
  Set(crate, Paths::Markers(), std::vector<NMX::Position>{{0, 0, 0}, {3, 4, 0}});
  VCalibrationScalingQml* operation = panel.createCalibrationScalingOperation();
  ASSERT_NE(operation, nullptr);
  EXPECT_EQ(operation->markerNames(), QStringList({"Marker 1", "Marker 2"}));
  for (const auto& [first, second] : {std::pair(0, 0), {-1, 0}, {0, 2}})
    EXPECT_EQ(operation->add(first, second).Name(), "InvalidArgument");
  EXPECT_FALSE(operation->add(0, 1).Failed());
  EXPECT_EQ(operation->apply().Name(), "InvalidValue") << "nothing has been measured";
  EXPECT_TRUE(operation->measurements()->setData(operation->measurements()->index(0, 2), 10));
  EXPECT_EQ(operation->scaleFactor(), 2);
  Set(crate, Paths::Markers(), std::vector<NMX::Position>{{0, 0, 0}, {3, 5, 0}});
  EXPECT_EQ(operation->apply().Name(), "Conflict");
  Set(crate, Paths::Markers(), std::vector<NMX::Position>{{0, 0, 0}, {3, 4, 0}});
  EXPECT_EQ(operation->apply().Name(), "Ok");
  EXPECT_EQ(Get<std::vector<NMX::Position>>(crate, Paths::Markers()).at(1), (NMX::Position{6, 8, 0}));
}

TEST_F(PanelTest, DevicesAreListedWithWhatTheyAreLinkedTo)
{
  const auto addDevice = [&](const std::string& urn, bool connected)
  {
    SetApplication("Application/Devices/" + urn + "/Type", std::string("Corvex1"));
    SetApplication("Application/Devices/" + urn + "/Connected", connected);
  };
  addDevice("b", true);
  QQmlEngine engine;
  VSubjectStoreQml& panel = MakePanel(0xFFFFFFFF, engine.rootContext());
  auto& work = *engine.rootContext()->contextProperty("rootContextSubjectPanel").value<VSubjectPanelQml*>();
  QAbstractItemModel& devices = *work.devices();
  const ModelShadow shadow(devices);
  addDevice("a", false);
  const Id glove = Add(ESubjectKind::SmartObjects, "Glove");
  EXPECT_EQ(panel.rebootSubjects(List({glove})).Reason(), "No device is linked to what is selected.");
  Set(glove, Paths::SmartClusters(), std::vector<NMX::SmartCluster>{{"Back", "b", 1, "Corvex1"}, {"Palm", "a", 2, ""}});
  const auto listed = [&devices]
  {
    Names texts;
    for (int row = 0; row < devices.rowCount(); ++row)
      for (const int role : {VDeviceModel::Urn, VDeviceModel::Connected, VDeviceModel::LinkedTo})
        texts.push_back(devices.index(row, 0).data(role).toString().toStdString());
    return texts;
  };
  WaitUntil([&] { return listed() == Names{"a", "false", "Glove", "b", "true", "Glove"}; });
  shadow.Check();

  const VResultGadget rebooted = panel.rebootSubjects(List({glove}));
  EXPECT_EQ(rebooted.Name(), "NotConnected") << "the other was tried all the same";
  EXPECT_EQ(rebooted.Reason(), "\"a\" cannot be restarted: The device is not connected.");
  selection->Select({{{}, -1, "a"}, {{}, -1, "b"}});
  SetApplication("Application/Devices/a/Type", {});
  SetApplication("Application/Devices/a/Connected", {});
  WaitUntil([&] { return listed() == Names{"b", "false", "Glove"}; });
  const std::vector<SelectionItem> left{{{}, -1, "b"}};
  WaitUntil([&] { return selection->Selection() == left; });
  shadow.Check();
  EXPECT_EQ(work.setClusterPattern(VStoreIdGadget(glove), 0, 5).Name(), "Ok");
  EXPECT_EQ(work.setClusterPattern(VStoreIdGadget(glove), 0, -1).Name(), "InvalidValue");
  EXPECT_EQ(work.setClusterPattern(VStoreIdGadget(glove), 2, 1).Name(), "InvalidIndex");
  static_cast<Simulation::VDeviceServices&>(*services.devices).Stop();
}

TEST_F(PanelTest, CalibrationSaysWhatIsPossibleAndWhyNot)
{
  const std::filesystem::path shipped = std::filesystem::path(SUBJECT_STORE_SOURCE_DIR) / "StandaloneHost/Calibration";
  ASSERT_TRUE(
      Settings::SetUpPanelSettings(*store, {{}, {}, {shipped / "Templates"}, {shipped / "Skins"}, {}}).Succeeded());
  const auto provider =
      std::make_shared<Calibration::VCalibrationProvider>(store, timers, Calibration::CalibrationTimes{});
  provider->Open(gui);
  services.calibration = provider;
  QQmlEngine engine;
  VSubjectStoreQml& panel = MakePanel(0xFFFFFFFF, engine.rootContext());
  VSubjectCalibrationQml& calibration =
      *engine.rootContext()->contextProperty("rootContextSubjectPanel").value<VSubjectPanelQml*>()->calibration();
  int told = 0;
  QObject::connect(&calibration, &VSubjectCalibrationQml::changed, &calibration, [&] { ++told; });
  EXPECT_EQ(calibration.cannotStart(), "No name is given.");
  EXPECT_EQ(calibration.start().Reason(), "No name is given.");
  EXPECT_EQ(calibration.stop().Name(), "NotAvailable");

  QAbstractItemModel& setup = *panel.subjectSetupParameterModel();
  EXPECT_TRUE(setup.setData(setup.index(0, 0), "Ada", StoreUI::ParameterRole::Value));
  WaitUntil([&] { return told > 0; });
  told = 0;
  EXPECT_EQ(calibration.cannotStart(), "");
  EXPECT_EQ(calibration.start().Name(), "Ok");
  EXPECT_TRUE(calibration.running());
  EXPECT_EQ(calibration.state(), "Looking for the T-pose");
  WaitUntil([&] { return told > 0; });
  EXPECT_EQ(calibration.acceptTPose().Name(), "Ok");
  EXPECT_EQ(calibration.cancel().Name(), "Ok");
  EXPECT_EQ(calibration.lastResult(), "The last calibration was cancelled.");

  // Whoever has started a run, the panel can end it.
  WaitUntil([&] { return calibration.cannotRecalibrate().isEmpty(); });
  std::shared_ptr<ISubjectCalibrationController> controller;
  provider->Controller(controller);
  NMX::TCalibrationSessionId session;
  EXPECT_EQ(controller->Perform(ECalibrationAction::StartRecalibration, session), IResult(EResult::Ok));
  EXPECT_EQ(calibration.acceptTPose().Name(), "Ok");
  EXPECT_EQ(calibration.stop().Name(), "Ok");
  EXPECT_EQ(calibration.lastResult(), "The last calibration was completed.");
  provider->Stop();
}

TEST_F(PanelTest, MarkersOfClustersAreThoseOfTheirTypesInTheirPatterns)
{
  QQmlEngine engine;
  MakePanel(0xFFFFFFFF, engine.rootContext());
  const auto& work = *engine.rootContext()->contextProperty("rootContextSubjectPanel").value<VSubjectPanelQml*>();
  const Id glove = Add(ESubjectKind::SmartObjects, "Glove");
  Set(glove, Paths::AdditionalMarkerPositions(), std::vector<NMX::Position>{{1, 2, 3}});
  Set(glove, Paths::SmartClusters(),
      std::vector<NMX::SmartCluster>{
          {"Back", "", 5, "Corvex1"}, {"Odd", "", 1, "Unknown"}, {"Palm", "", 7, "Corvex1"}});
  const QVariantList markers = work.markers(VStoreIdGadget(glove));
  ASSERT_EQ(markers.size(), 17);
  const auto of = [&](int marker, const char* key) { return markers[marker].toMap()[key].toDouble(); };
  EXPECT_EQ(of(0, "x"), 1);
  EXPECT_EQ(of(0, "pattern"), 0);
  EXPECT_EQ(of(1, "x"), -1.75);
  EXPECT_EQ(of(1, "pattern"), 5);
  EXPECT_EQ(of(9, "pattern"), 7);
  EXPECT_EQ(of(9, "y"), of(1, "y"));
  EXPECT_DOUBLE_EQ(of(9, "x") - of(1, "x"), 24.25 + 24.25 + 30) << "beside the first";
  EXPECT_THAT(work.markers(VStoreIdGadget()), IsEmpty());
}
