#include "StandaloneHost/Files/SubjectConfiguration.h"

#include "StandaloneHost/Store/IArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace Files
{

namespace
{

using NMX::ESubjectKind;
using NMX::TSubjectStoreId;
using Path = std::filesystem::path;
namespace Paths = NMX::Paths;

/// A folder of its own for each test.
class SubjectConfigurationTest : public testing::Test
{
protected:
  SubjectConfigurationTest()
      : m_folder(std::filesystem::temp_directory_path() / ("subject-configuration-" + std::to_string(getpid())))
  {
    std::filesystem::create_directories(m_folder);
  }
  ~SubjectConfigurationTest() override { std::filesystem::remove_all(m_folder); }

  Path Write(const std::string& name, std::string_view text) const
  {
    std::ofstream(m_folder / name, std::ios::binary) << text;
    return m_folder / name;
  }

  ConfigurationCounts Load(const std::vector<Path>& files) { return LoadSubjectConfigurations(*m_store, files); }

  /// The message of the error, with files by their bare names; "loaded" when there is none.
  std::string Refusal(const std::vector<Path>& files)
  {
    try
    {
      Load(files);
      return "loaded";
    }
    catch (const ConfigurationError& error)
    {
      std::string text = error.what();
      const std::string folder = m_folder.string() + '/';
      for (auto at = text.find(folder); at != std::string::npos; at = text.find(folder))
        text.erase(at, folder.size());
      return text;
    }
  }

  /// The refusal of a file that holds the text, without the file's name.
  std::string RefusalOf(std::string_view text)
  {
    const std::string refusal = Refusal({Write("a.xml", text)});
    return refusal.starts_with("a.xml:") ? refusal.substr(6) : refusal;
  }

  TSubjectStoreId Id(const std::string& name) const
  {
    TSubjectStoreId id;
    EXPECT_EQ(m_store->Reader()->FindByName(name, id), NMX::EResult::Ok) << name;
    return id;
  }

  template <class T>
  T Value(const std::string& name, NMX::EntryPath path) const
  {
    T value{};
    EXPECT_EQ(NMX::Read(*m_store->Reader(), Id(name), path, value), NMX::EResult::Ok) << name << ' ' << path;
    return value;
  }

  NMX::Value ApplicationValue(std::string_view path) const
  {
    const auto reader = m_store->Reader();
    const NMX::Value* value = reader->FindApplicationEntry(NMX::EntryPath(path));
    return value != nullptr ? *value : NMX::Value{};
  }

  Path m_folder;
  std::shared_ptr<Store::VStore> m_store = NMX::MakeShared<Store::VStore>();
};

/// A file with those sections, which begin on line 1 in column 35.
std::string File(std::string_view sections)
{
  return "<SubjectConfiguration version='1'>" + std::string(sections) + "</SubjectConfiguration>";
}

/// The subjects begin on line 2.
std::string Subjects(std::string_view subjects)
{
  return File("<Subjects>\n" + std::string(subjects) + "</Subjects>");
}

/// A basic object with that content, which begins on line 3.
std::string Object(std::string_view content)
{
  return Subjects("<Subject kind='BasicObjects' name='Crate'>\n" + std::string(content) + "</Subject>");
}

/// The content begins on line 3.
std::string Parameters(std::string_view content)
{
  return Subjects("<Subject kind='GeneralSubjects' name='Guest'><Parameters>\n" + std::string(content) +
                  "</Parameters></Subject>");
}

constexpr const char* warning = "<Warnings><WarningObjectConfusion>true</WarningObjectConfusion></Warnings>";

TEST_F(SubjectConfigurationTest, LoadsTheExampleStage)
{
  EXPECT_EQ(Load({Path(SUBJECT_STORE_SOURCE_DIR) / "examples/stage.xml"}), (ConfigurationCounts{8, 3, 27}));

  const std::map<ESubjectKind, std::size_t> expected{{ESubjectKind::BasicObjects, 12},
                                                     {ESubjectKind::SmartObjects, 6},
                                                     {ESubjectKind::CharactersFromClusters, 2},
                                                     {ESubjectKind::GeneralSubjects, 2},
                                                     {ESubjectKind::LabellingClusters, 2},
                                                     {ESubjectKind::Markerless, 1},
                                                     {ESubjectKind::Props, 1},
                                                     {ESubjectKind::SceneMeshes, 1}};
  for (const auto& [kind, count] : expected)
  {
    std::vector<TSubjectStoreId> ids;
    ASSERT_EQ(m_store->Reader()->Subjects(kind, ids), NMX::EResult::Ok);
    EXPECT_EQ(ids.size(), count) << kind;
  }

  EXPECT_EQ(Value<NMX::Colour>("Lantern", Paths::ColourRGBA()), (NMX::Colour{0xFF, 0xE0, 0x66, 0x80}));
  EXPECT_EQ(Value<NMX::Colour>("Crate", Paths::ColourRGBA()), (NMX::Colour{0xD9, 0xA4, 0x41, 0xFF}));
  EXPECT_EQ(Value<std::wstring>("Tavern floor", Paths::FilePath()), L"meshes/tavern-floor.obj");
  EXPECT_EQ(Value<std::int32_t>("Innkeeper", Paths::Calibration()), 2);
  EXPECT_TRUE(Value<bool>("Innkeeper", Paths::ModelOutputCGM2()));
  EXPECT_FALSE(Value<bool>("Stunt double", Paths::RoleSolving()));
  EXPECT_FALSE(Value<bool>("Cellar door", Paths::Enabled()));
  EXPECT_EQ(Value<TSubjectStoreId>("Lamp oil", Paths::ParentSubjectId()), Id("Lantern"));

  EXPECT_EQ(Value<std::vector<NMX::SmartCluster>>("Waist belt", Paths::SmartClusters()),
            (std::vector<NMX::SmartCluster>{{"Buckle", "corvex1-0413", 3, "Corvex1"},
                                            {"Back", "corvex1-0414", 4, "Corvex1"}}));
  EXPECT_EQ(Value<std::vector<NMX::Position>>("Waist belt", Paths::AdditionalMarkerPositions()),
            (std::vector<NMX::Position>{{136.5, 82, 14}, {-129, 95.5, 22}}));

  const auto slots = Value<std::vector<NMX::Slot>>("Ranger", Paths::Slots());
  ASSERT_EQ(slots.size(), 8U);
  EXPECT_EQ(slots[3], (NMX::Slot{TSubjectStoreId(4), "LeftHand"}));
  EXPECT_EQ(Value<TSubjectStoreId>("Left glove", Paths::ParentSubjectId()), Id("Ranger"));
  EXPECT_EQ(Value<TSubjectStoreId>("Left glove", Paths::ParentSubjectSlotId()), TSubjectStoreId(4));

  EXPECT_EQ(ApplicationValue("Application/Devices/corvex1-0416/Type"), NMX::Value(std::string("Corvex1")));
  EXPECT_EQ(ApplicationValue("Application/Devices/corvex1-0416/Connected"), NMX::Value(false));
  EXPECT_EQ(ApplicationValue("Application/Devices/corvex1-0415/Charging"), NMX::Value(true));
  EXPECT_EQ(ApplicationValue("Application/Devices/corvex1-0411/Charging"), NMX::Value(false));
  EXPECT_EQ(ApplicationValue("Application/Devices/corvex1-0411/Battery"), NMX::Value(87U));
  EXPECT_EQ(ApplicationValue("Application/Devices/corvex1-0411/Radio"), NMX::Value(12U));
  EXPECT_EQ(ApplicationValue("Application/ObjectPresets/1/Name"), NMX::Value(std::string("Set dressing")));
  EXPECT_EQ(ApplicationValue("Application/ObjectPresets/1/ReadOnly"), NMX::Value(true));
  EXPECT_EQ(ApplicationValue("Application/ObjectPresets/2/Parameters/ColourRGBA"),
            NMX::Value(NMX::Colour{0xCC, 0x88, 0x44, 0xFF}));
}

/// What no file format can see: template groups whose objects differ, and proximity groups whose objects cannot be told
/// apart.
TEST_F(SubjectConfigurationTest, GroupsOfTheExampleStageAreSound)
{
  Load({Path(SUBJECT_STORE_SOURCE_DIR) / "examples/stage.xml"});
  std::vector<TSubjectStoreId> ids;
  const auto reader = m_store->Reader();
  ASSERT_EQ(reader->Subjects(ESubjectKind::BasicObjects, ids), NMX::EResult::Ok);

  std::map<std::string, std::vector<std::vector<NMX::Position>>> markersOfTemplate;
  std::map<std::string, std::multiset<std::string>> templatesOfProximity;
  for (const TSubjectStoreId id : ids)
  {
    std::string templateGroup;
    std::string proximityGroup;
    std::vector<NMX::Position> markers;
    ASSERT_TRUE(NMX::Read(*reader, id, Paths::TemplateGroupName(), templateGroup).Succeeded());
    ASSERT_TRUE(NMX::Read(*reader, id, Paths::ProximityGroupName(), proximityGroup).Succeeded());
    ASSERT_TRUE(NMX::Read(*reader, id, Paths::Markers(), markers).Succeeded());
    EXPECT_TRUE(markers.size() >= 4 && markers.size() <= 9) << id;
    if (!templateGroup.empty())
      markersOfTemplate[templateGroup].push_back(markers);
    if (!proximityGroup.empty())
      templatesOfProximity[proximityGroup].insert(templateGroup);
  }
  EXPECT_EQ(markersOfTemplate.size(), 2U);
  for (const auto& [group, layouts] : markersOfTemplate)
    EXPECT_TRUE(layouts.size() == 2 && layouts[0] == layouts[1]) << group;
  for (const auto& [group, templates] : templatesOfProximity)
  {
    EXPECT_TRUE(templates.contains("")) << group << " has no unique object";
    for (const std::string& each : templates)
      EXPECT_TRUE(each.empty() || templates.count(each) == 1) << group << ' ' << each;
  }
}

TEST_F(SubjectConfigurationTest, ReferencesPointForwardAndToOtherFiles)
{
  const Path first = Write("first.xml", Subjects(R"(<Subject kind="CFCs" name="Miner" parent="Crew">
    <Slots><Slot name="Head"/><Slot name="Tool" object="Pick"/></Slots></Subject>)"));
  const Path second = Write("second.xml", Subjects(R"(<Subject kind="BasicObjects" name="Pick"/>
    <Subject kind="GeneralSubjects" name="Crew"/>)"));

  EXPECT_EQ(Load({first, second}), (ConfigurationCounts{0, 0, 3}));
  EXPECT_EQ(Value<TSubjectStoreId>("Miner", Paths::ParentSubjectId()), Id("Crew"));
  EXPECT_EQ(Value<TSubjectStoreId>("Pick", Paths::ParentSubjectId()), Id("Miner"));
  EXPECT_EQ(Value<TSubjectStoreId>("Pick", Paths::ParentSubjectSlotId()), TSubjectStoreId(2));
}

TEST_F(SubjectConfigurationTest, TextsAreTakenExactly)
{
  const std::string face = "\xF0\x9F\x98\x80";
  const std::string content = "<Parameters><Retarget> a<![CDATA[<b>]]><!-- two -->&#228;" + face +
                              "</Retarget><Calibration>-2147483648</Calibration></Parameters>";
  Load({Write("a.xml",
              "\xEF\xBB\xBF<?xml version='1.0' encoding='utf-8'?>\r\n<!-- one -->" +
                  Subjects("<Subject kind='GeneralSubjects' name='A &amp; " + face + "'>" + content + "</Subject>"))});
  const std::string name = "A & " + face;
  Load({Write("b.xml",
              Object("<Parameters encoding='percent'><PresetName encoding='percent'>%01%25%c3%A9%00</PresetName>"
                     "<TemplateGroupName>%41</TemplateGroupName></Parameters>"))});
  EXPECT_EQ(Value<std::string>("Crate", Paths::PresetName()), std::string("\x01%\u00E9\0", 5));
  EXPECT_EQ(Value<std::string>("Crate", Paths::TemplateGroupName()), "%41") << "its own element announces nothing";
  EXPECT_EQ(Value<std::wstring>(name, Paths::Retarget()), L" a<b>\u00E4\U0001F600");
  EXPECT_EQ(Value<std::int32_t>(name, Paths::Calibration()), -2147483647 - 1);
}

struct Malformed
{
  std::string text;
  std::string begin;         ///< of the message, with the place
  std::string expected = {}; ///< somewhere in the message
};

TEST_F(SubjectConfigurationTest, RefusesMalformedFilesAndTellsWhere)
{
  const std::string device = "<Device urn='u' type='t' connected='true' charging='false' battery='1' radio='0'/>";
  const auto changed = [](std::string text, std::string_view from, std::string_view to)
  { return text.replace(text.find(from), from.size(), to); };
  const std::string preset = "<Preset id='1' name='Dressing' readOnly='true'/>";
  const auto presets = [](std::string_view text) { return File("<Presets>\n" + std::string(text) + "</Presets>"); };
  const auto devices = [](std::string_view text) { return File("<Devices>\n" + std::string(text) + "</Devices>"); };
  const auto character = [](std::string_view slots)
  { return Subjects("<Subject kind='CFCs' name='Miner'><Slots>\n" + std::string(slots) + "</Slots></Subject>"); };
  const auto cluster = [](std::string_view attributes)
  {
    return Subjects("<Subject kind='SmartObjects' name='Torch'><SmartObject><SmartClusters>\n<SmartCluster " +
                    std::string(attributes) + "/></SmartClusters></SmartObject></Subject>");
  };
  const auto many = [](const std::string& element, int count)
  {
    std::string elements;
    for (int i = 0; i < count; ++i)
      elements += element;
    return elements;
  };
  std::string deep = "<Parameters>";
  for (int depth = 0; depth < 100000; ++depth)
    deep += "<Parameters>";
  std::string attributes;
  for (int i = 0; i < 300000; ++i)
    attributes += " a" + std::to_string(i) + "=''";

  const std::vector<Malformed> corpus{
      // The file as such
      {"", "1:1: the file is empty"},
      {"\xEF\xBB\xBF", "1:1: the file is empty"},
      {" \n ", "2:2: the file ends too early", "expected an element"},
      {"stage", "1:1: not well-formed XML"},
      {"<SubjectConfiguration version='1'>\n<Subjects><Subject \xFF", "2:20: this is not a UTF-8 character", "UTF-8"},
      {"\xFF\xFE<", "1:1: this is not a UTF-8 character"},
      {"<SubjectConfiguration version='1'>\n<Subjects" + attributes + "/></SubjectConfiguration>",
       "2:1: a tag of more than 65536 bytes"},
      {"<?xml version='1.0' encoding='ISO-8859-1'?>" + File(""), "1:1: the declared encoding is \"ISO-8859-1\"",
       "expected UTF-8"},
      {"<!-- x -->\n <!DOCTYPE SubjectConfiguration>" + File(""), "2:2: a document type declaration is not allowed"},
      {"<!DOCTYPE a [<!ENTITY b \"x\"><!ENTITY c \"&b;&b;&b;&b;&b;&b;&b;&b;\">]>" + File("&c;"),
       "1:1: a document type declaration is not allowed"},
      {File("&b;"), "1:37: not well-formed XML in <SubjectConfiguration>: Entity 'b' not declared"},
      {"<SubjectConfiguration version='1'>\n  <Subjects>\n", "3:1: the file ends too early", "expected </Subjects>"},
      {"<SubjectConfiguration version='1'>\n  <Subj", "2:8: the file ends too early",
       "expected </SubjectConfiguration>"},
      {File("\n  <Subjects>\n  </Subject>\n"), "3:3: not well-formed XML in <Subjects>",
       "expected content or </Subjects>"},
      {File("") + "\n<Subjects/>", "2:1: not well-formed XML"},
      {"<Subjects/>", "1:1: unknown element <Subjects>", "expected SubjectConfiguration"},
      {"<SubjectConfiguration/>", "1:1: <SubjectConfiguration> lacks an attribute", "expected \"version\""},
      {"<SubjectConfiguration version='2'/>", "1:1: the version is \"2\"", "expected 1"},
      {"<SubjectConfiguration version='1' xmlns='u'/>", "1:1: unknown attribute \"xmlns\"", "expected version"},
      {File("<Objects/>"), "1:35: unknown element <Objects>", "expected one of Devices, Presets, Subjects"},
      {File("<Devices on='1'/>"), "1:35: unknown attribute \"on\" of <Devices>", "expected none"},
      {File("<Devices/>\n <Devices/>"), "2:2: repeated <Devices>", "a.xml:1:35"},
      {File("<Devices/>\n x <Presets/>"), "2:2: unexpected text \"x\" in <SubjectConfiguration>"},
      {File("<!-- \xC3\xA4\xF0\x9F\x98\x80 --> <Subject/>"), "1:47: unknown element <Subject>"},

      // Devices and presets
      {devices(changed(device, "urn='u'", "")), "2:1: <Device> lacks an attribute", "expected \"urn\""},
      {devices(changed(device, "'u'", "''")), "2:1: attribute \"urn\" of <Device> is empty"},
      {devices(changed(device, "'u'", '\'' + std::string(1025, 'u') + '\'')),
       "2:1: attribute \"urn\" of <Device> is a"},
      {devices(changed(device, "'t'", '\'' + std::string(1025, 't') + '\'')),
       "2:1: attribute \"type\" of <Device> is a"},
      {devices(changed(device, "'u'", "'a/b'")), "2:1: the urn is \"a/b\""},
      {devices(changed(device, "'true'", "'1'")), "2:1: attribute \"connected\" of <Device> is \"1\"", "true or false"},
      {devices(changed(device, "'1'", "'101'")), "2:1: the battery has 101 percent", "at most 100"},
      {devices(changed(device, "radio", "range")), "2:1: unknown attribute \"range\" of <Device>",
       "urn, type, connected, charging, battery, radio"},
      {devices(changed(device, "/>", ">\n <Radio/></Device>")), "3:2: unknown element <Radio>", "expected none"},
      {devices(device + "\n  " + device), "3:3: duplicate device \"u\"", "a.xml:2:1"},
      {presets(changed(preset, "'1'", "'0'")), "2:1: the id of the preset is 0"},
      {presets(changed(preset, "'1'", "'4294967296'")), "2:1: attribute \"id\" of <Preset> is \"4294967296\""},
      {presets(preset + "\n" + changed(preset, "Dressing", "Other")), "3:1: duplicate preset 1", "a.xml:2:1"},
      {presets(preset + "\n" + changed(preset, "'1'", "'2'")), "3:1: duplicate preset name \"Dressing\"", "a.xml:2:1"},
      {presets(changed(preset, "/>", ">\n <Name>x</Name></Preset>")), "3:2: unknown element <Name>",
       "AutoAssignEnabled, AutoAssignedName, ColourRGBA, Enabled"},

      // Entries
      {Object("<Parameters>\n <Colur>#ffffff</Colur></Parameters>"), "4:2: unknown element <Colur>",
       "AutoAssignEnabled, AutoAssignedName, ColourRGBA, Enabled"},
      {Object("<SmartObject/>"), "3:1: unknown element <SmartObject>",
       "expected one of Markers, Parameters, Roles, Warnings"},
      {Object(" <SubjectId>1</SubjectId>"), "3:2: unknown element <SubjectId>"},
      {Object("<ParentSubjectId>1</ParentSubjectId>"), "3:1: unknown element <ParentSubjectId>"},
      {Object("<Parameters><Name>x</Name></Parameters>"), "3:13: unknown element <Name>"},
      {Parameters("</Parameters><ReloadRetargetAction>1</ReloadRetargetAction><Parameters>"),
       "3:14: unknown element <ReloadRetargetAction>"},
      {Object(deep), "3:13: unknown element <Parameters>"},
      {Object("<Parameters>\n<Enabled>true</Enabled>\n<Enabled>true</Enabled></Parameters>"), "5:1: repeated <Enabled>",
       "a.xml:4:1"},
      {Object("<Parameters/>\n<Parameters/>"), "4:1: repeated <Parameters>", "a.xml:3:1"},
      {Object("<Parameters>x</Parameters>"), "3:13: unexpected text \"x\" in <Parameters>"},
      {Object("<Parameters><Enabled on='1'>true</Enabled></Parameters>"), "3:13: unknown attribute \"on\"",
       "expected none"},
      {Object("<Parameters><Enabled><b/>true</Enabled></Parameters>"), "3:22: unexpected element <b> in <Enabled>"},
      {Object("<Parameters>\n  <Enabled>True</Enabled></Parameters>"), "4:3: <Enabled> is \"True\"", "true or false"},
      {Object("<Parameters><Enabled/></Parameters>"), "3:13: <Enabled> is \"\""},
      {Object("<Parameters><ColourRGBA>#12345</ColourRGBA></Parameters>"), "3:13: <ColourRGBA> is \"#12345\"",
       "#AARRGGBB"},
      {Object("<Parameters><ColourRGBA>#12345g</ColourRGBA></Parameters>"), "3:13: <ColourRGBA> is \"#12345g\""},
      {Object("<Parameters><ColourRGBA>0ff336699</ColourRGBA></Parameters>"), "3:13: <ColourRGBA> is"},
      {Object("<Parameters><Flags>2</Flags></Parameters>"),
       "3:13: the store refuses the value of Parameters/Flags: InvalidValue"},
      {Parameters("<Calibration>2147483648</Calibration>"), "3:1: <Calibration> is \"2147483648\"", "2147483647"},
      {Parameters("<Retarget>" + std::string(4097, 'p') + "</Retarget>"), "3:1: <Retarget> is a text of 4097 bytes",
       "expected at most 4096"},
      {Object("<Parameters><PresetName>" + std::string(1025, 'p') + "</PresetName></Parameters>"),
       "3:13: <PresetName> is a text of 1025 bytes", "expected at most 1024"},
      {Object("<Parameters><PresetName encoding='hex'>p</PresetName></Parameters>"),
       "3:13: the encoding of <PresetName> is \"hex\"", "expected percent"},
      {Object("<Parameters><PresetName encoding='percent'>a%4</PresetName></Parameters>"),
       "3:13: <PresetName> is \"a%4\"", "expected two hexadecimal digits after each %"},
      {Object("<Parameters><PresetName encoding='percent'>a%C3</PresetName></Parameters>"),
       "3:13: <PresetName> is \"a%C3\"", "UTF-8"},
      {Subjects("<Subject kind='Props' name='%zz' encoding='percent'/>"), "2:1: attribute \"name\" of <Subject> is"},
      {Parameters("<Calibration>1 </Calibration>"), "3:1: <Calibration> is \"1 \""},
      {Parameters("<Calibration>a\nb" + std::string(1000, 'c') + "</Calibration>"), "3:1: <Calibration> is \"a b"},
      {Object("<Markers>\n<Marker x='0' y='0'/></Markers>"), "4:1: <Marker> lacks an attribute", "expected \"z\""},
      {Object("<Markers>\n<Marker x='0' y='nan' z='0'/></Markers>"), "4:1: attribute \"y\" of <Marker> is \"nan\"",
       "a finite number"},
      {Object("<Markers>\n<Marker x='0' y='1e999' z='0'/></Markers>"), "4:1: attribute \"y\""},
      {Object("<Markers>\n" + many("<Marker x='0' y='0' z='0'/>\n", 4097) + "</Markers>"),
       "4100:1: one marker too many, expected at most 4096"},
      {Subjects("<Subject kind='SmartObjects' name='Torch'><SmartObject><SmartClusters>\n" +
                many("<SmartCluster label='l' pattern='1' type='t'/>\n", 257) +
                "</SmartClusters></SmartObject></Subject>"),
       "259:1: one cluster too many, expected at most 256"},
      {Object("<Markers><marker/></Markers>"), "3:10: unknown element <marker>", "expected Marker"},
      {cluster("label='" + std::string(1025, 'l') + "' pattern='1' type='t'"),
       "3:1: attribute \"label\" of <SmartCluster> is a text of 1025 bytes", "expected at most 1024"},
      {cluster("label='l' pattern='1' type='t" + std::string(1024, 't') + '\''), "3:1: attribute \"type\""},
      {cluster("label='l' pattern='1' type='t' device='u" + std::string(1024, 'u') + '\''),
       "3:1: attribute \"device\""},
      {cluster("label='l' pattern='-1' type='t'"), "3:1: attribute \"pattern\" of <SmartCluster> is \"-1\""},

      // Subjects and what they refer to
      {Subjects("<Subject kind='Objects' name='x'/>"), "2:1: the kind is \"Objects\"",
       "BasicObjects, SmartObjects, CFCs"},
      {Subjects("<Subject kind='Props'/>"), "2:1: <Subject> lacks an attribute", "expected \"name\""},
      {Subjects("<Subject kind='Props' name='a/b'/>"), "2:1: the store refuses the name \"a/b\" (InvalidName)"},
      {Subjects("<Subject kind='Props' name=''/>"), "2:1: the store refuses the name \"\" (InvalidName)"},
      {Subjects("<Subject kind='Props' name='x'/>\n <Subject kind='Markerless' name='x'/>"),
       "3:2: duplicate subject name \"x\"", "a.xml:2:1"},
      {Subjects("<Subject kind='Props' name='caf\u00E9'/>\n <Subject kind='Markerless' name='cafe\u0301'/>"),
       "3:2: duplicate subject name \"cafe\u0301\"", "a.xml:2:1"},
      {Subjects("<Subject kind='Props' name='..'/>"), "2:1: the store refuses the name \"..\" (InvalidName)"},
      {Subjects("<Subject kind='Props' name='x' parent='y'/>"), "2:1: unknown parent \"y\""},
      {Subjects("<Subject kind='Props' name='x' parent='x'/>"), "2:1: parent \"x\" would make"},
      {Subjects("<Subject kind='Props' name='x' parent='y'/>\n<Subject kind='Props' name='y' parent='x'/>"),
       "3:1: parent \"x\" would make", "without a cycle"},
      {character("<Slot name='" + std::string(1025, 's') + "'/>"), "3:1: attribute \"name\" of <Slot> is a text"},
      {character(many("<Slot name='s'/>\n", 257)), "259:1: one slot too many, expected at most 256"},
      {character("<Slot name='Head' object='Cap'/>"), "3:1: unknown object \"Cap\""},
      {character("<Slot name='Head' object='Miner'/>"), "3:1: \"Miner\" is of kind CFCs", "a basic or smart object"},
      {character("<Slot name='Head' object='Cap'/>\n<Slot name='Tool' object='Cap'/></Slots></Subject>"
                 "<Subject kind='BasicObjects' name='Cap'><Parameters/></Subject>"
                 "<Subject kind='CFCs' name='Other'><Slots>"),
       "4:1: object \"Cap\" is already in the slot", "a.xml:3:1"},
      {character("<Slot name='Head' object='Cap'/></Slots></Subject>"
                 "<Subject kind='BasicObjects' name='Cap' parent='Other'/><Subject kind='CFCs' name='Other'><Slots>"),
       "3:1: object \"Cap\" has a parent of its own"},
      {Subjects("<Subject kind='BasicObjects' name='Cap'/><Subject kind='Props' name='Crew' parent='Cap'/>\n"
                "<Subject kind='CFCs' name='Miner' parent='Crew'><Slots>\n<Slot name='Head' object='Cap'/></Slots>"
                "</Subject>"),
       "4:1: object \"Cap\" would make"},
  };
  for (const Malformed& malformed : corpus)
  {
    const std::string refusal = RefusalOf(malformed.text);
    SCOPED_TRACE(malformed.text.substr(0, 300));
    EXPECT_EQ(refusal.substr(0, malformed.begin.size()), malformed.begin) << refusal;
    EXPECT_NE(refusal.find(malformed.expected), std::string::npos) << refusal;
    EXPECT_EQ(refusal.find('\n'), std::string::npos) << refusal;
    EXPECT_LT(refusal.size(), 400U);
    EXPECT_TRUE(m_store->Empty());
  }
}

TEST_F(SubjectConfigurationTest, RefusesWhatIsNoReadableFile)
{
  const Path large = Write("large.xml", "<");
  std::filesystem::resize_file(large, (std::uintmax_t{64} << 20) + 1);
  std::filesystem::create_symlink(m_folder / "loop.xml", m_folder / "loop.xml");
  const std::map<Path, std::string> refusals{
      {m_folder / "none.xml", "none.xml:1:1: the file cannot be read: No such file or directory"},
      {m_folder / "loop.xml", "loop.xml:1:1: the file cannot be read: Too many levels of symbolic links"},
      {"/dev/zero", "/dev/zero:1:1: this is a device or a pipe, expected a file"},
      {large, "large.xml:1:1: the file has 67108865 bytes, expected at most 67108864"}};
  for (const auto& [file, refusal] : refusals)
    EXPECT_EQ(Refusal({file}), refusal);
  EXPECT_NE(Refusal({m_folder}).find(":1:1: this is a directory, expected a file"), std::string::npos);
}

TEST_F(SubjectConfigurationTest, RefusesEverythingWhenOneFileIsWrong)
{
  const Path good = Write("good.xml", Object(warning));
  EXPECT_EQ(Refusal({good, Write("bad.xml", Subjects("<Subjekt/>"))}),
            "bad.xml:2:1: unknown element <Subjekt>, expected Subject");
  EXPECT_EQ(Refusal({good, Write("bad.xml", Object(""))}),
            "bad.xml:2:1: duplicate subject name \"Crate\", expected another than at good.xml:2:1");
  EXPECT_TRUE(m_store->Empty());
}

TEST_F(SubjectConfigurationTest, LeavesAStoreThatHoldsTheSameAsItIs)
{
  const std::string device =
      R"(<Devices><Device urn="u" type="t" connected="true" charging="false" battery="1" radio="2"/></Devices>)";
  Load({Write("a.xml", File(device)), Write("b.xml", Object(warning))});

  EXPECT_EQ(RefusalOf(Subjects("<Subject kind='Props' name='Barrel'/>\n<Subject kind='Props' name='Crate'/>")),
            "3:1: the store refuses the subject \"Crate\": AlreadyPresent");
  EXPECT_EQ(RefusalOf(File("\n" + device)),
            "2:10: the store already holds \"Application/Devices/u/Type\", expected it to be new");
  TSubjectStoreId id;
  EXPECT_EQ(m_store->Reader()->FindByName("Barrel", id), NMX::EResult::NotFound);
}

class FullArchive final : public Store::IArchive
{
public:
  Store::ChangeSet Load() override { return {{}, {}, TSubjectStoreId(1)}; }
  NMX::IResult Keep(const Store::ChangeSet& /*changes*/, const Store::StoreState& /*content*/) override
  {
    return NMX::EResult::DiskFull;
  }
};

TEST_F(SubjectConfigurationTest, TellsWhenTheStoreCannotKeepIt)
{
  m_store = NMX::MakeShared<Store::VStore>(std::make_unique<FullArchive>());
  EXPECT_EQ(Refusal({Write("a.xml", Object(""))}), "the store cannot keep the subject configuration: DiskFull");
  EXPECT_TRUE(m_store->Empty());
}

}

}
