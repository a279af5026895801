#include "StandaloneHost/Calibration/LabellingTemplateFile.h"
#include "StandaloneHost/Calibration/SubjectSkinFile.h"

#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <string_view>
#include <utility>

namespace Calibration
{

namespace
{

using NMX::ESubjectKind;
using Path = std::filesystem::path;

class CalibrationTemplateFilesTest : public testing::Test
{
protected:
  Path Write(std::string_view text) const
  {
    std::ofstream(m_file, std::ios::binary) << text;
    return m_file;
  }

  /// What follows the file's name in the message of the error; "read" when there is none.
  template <class Read>
  std::string Refusal(Read read, std::string_view text) const
  {
    try
    {
      (void)read(Write(text));
      return "read";
    }
    catch (const Files::ConfigurationError& error)
    {
      return std::string(error.what()).substr(m_file.string().size() + 1);
    }
  }

  const TemporaryFolder m_folder;
  const Path m_file = m_folder.Path() / "a";
  const Path m_shipped = Path(SUBJECT_STORE_SOURCE_DIR) / "StandaloneHost/Calibration";
};

/// A file with that content, which begins on line 2.
std::string File(const std::string& root, const std::string& content)
{
  return '<' + root + " version='1'>\n" + content + "</" + root + '>';
}

const std::string segments = "<Segments><Segment name='Hip'/><Segment name='Toe' parent='Hip'/></Segments>";
const std::vector<Files::Segment> hipAndToe{{"Hip", ""}, {"Toe", "Hip"}};

TEST_F(CalibrationTemplateFilesTest, ReadsLabellingTemplatesWhicheverSectionIsFirst)
{
  const auto read = [this](const std::string& content)
  { return ReadLabellingTemplate(Write(File("LabellingTemplate", content))); };
  const std::string children = "<Children><Child kind='Props' name='Staff'/><Child parent='Staff' name='Spitze &#252;' "
                               "kind='LabellingClusters'/><Child kind='Props' name='Hat'></Child></Children>";
  const std::string roles = "<Roles><Labelling>false</Labelling></Roles>";
  const auto [prop, cluster] = std::pair{ESubjectKind::Props, ESubjectKind::LabellingClusters};
  const LabellingTemplate expected{
      hipAndToe, {{prop, "Staff", ""}, {cluster, "Spitze \xC3\xBC", "Staff"}, {prop, "Hat", ""}}, false};
  EXPECT_EQ(read(segments + children + roles), expected);
  EXPECT_EQ(read(roles + children + segments), expected);
  EXPECT_EQ(read(segments + "<Roles/>"), (LabellingTemplate{hipAndToe, {}, true}));
}

TEST_F(CalibrationTemplateFilesTest, ReadsEachTruthValueOfASkinByItself)
{
  const std::pair<std::string, SubjectSkin> table[] = {
      {"", {hipAndToe, true, false, false, false}},
      {"<Roles><Solving>false</Solving></Roles>", {hipAndToe, false, false, false, false}},
      {"<Roles><Retargeting>true</Retargeting></Roles>", {hipAndToe, true, true, false, false}},
      {"<ModelOutputs><CGM2>true</CGM2></ModelOutputs>", {hipAndToe, true, false, true, false}},
      {"<ModelOutputs><PluginKinex>true</PluginKinex></ModelOutputs>", {hipAndToe, true, false, false, true}},
  };
  for (const auto& [sections, skin] : table)
    EXPECT_EQ(ReadSubjectSkin(Write(File("SubjectSkin", sections + segments))), skin) << sections;
}

TEST_F(CalibrationTemplateFilesTest, ReadsTheShippedFiles)
{
  const LabellingTemplate performer = ReadLabellingTemplate(m_shipped / "Templates/Performer.lbt");
  EXPECT_EQ(performer.segments.size(), 21U);
  EXPECT_TRUE(performer.children.empty());
  EXPECT_THAT(ReadLabellingTemplate(m_shipped / "Templates/Performer with staff.lbt").children,
              testing::ElementsAre(ChildTemplate{ESubjectKind::Props, "Staff", ""},
                                   ChildTemplate{ESubjectKind::LabellingClusters, "Staff head", "Staff"}));
  EXPECT_EQ(ReadSubjectSkin(m_shipped / "Skins/Adult.skin"),
            (SubjectSkin{performer.segments, true, true, true, false}));
  EXPECT_EQ(ReadSubjectSkin(m_shipped / "Skins/Child.skin").segments.size(), 16U);
}

TEST_F(CalibrationTemplateFilesTest, RefusesMalformedFilesAndTellsWhere)
{
  // Sound but for the children, which begin on line 3
  const auto inChildren = [](const std::string& content)
  { return File("LabellingTemplate", segments + "<Children>\n" + content + "</Children>"); };
  std::string most;
  for (int i = 0; i < 64; ++i)
    most += "<Child kind='Props' name='" + std::to_string(i) + "'/>\n";

  const std::pair<std::string, std::string> templates[] = {
      {File("SubjectSkin", segments), "1:1: unknown element <SubjectSkin>, expected LabellingTemplate"},
      {File("LabellingTemplate", "<Roles/>"), "1:1: <LabellingTemplate> lacks an element, expected Segments"},
      {File("LabellingTemplate", "<Roles>\n<Solving/></Roles>"), "3:1: unknown element <Solving>, expected Labelling"},
      {inChildren(""), "2:77: <Children> is empty, expected at least one Child"},
      {inChildren("<Child name='A'/>"), "3:1: <Child> lacks an attribute, expected \"kind\""},
      {inChildren("<Child kind='CFCs' name='A'/>"), "3:1: the kind is \"CFCs\", expected one of Props, Labelling"},
      {inChildren("<Child kind='Props' name=''/>"), "3:1: attribute \"name\" of <Child> is empty"},
      {inChildren("<Child kind='Props' name='A'/>\n <Child kind='LabellingClusters' name='A' parent='A'/>"),
       "4:2: repeated child \"A\", expected it once"},
      {inChildren("<Child kind='Props' name='A' parent=''/>"), "3:1: attribute \"parent\" of <Child> is empty"},
      {inChildren("<Child kind='Props' name='A' parent='Hip'/>"),
       "3:1: unknown parent \"Hip\", expected the name of a child that stands before"},
      {inChildren("<Child kind='Props' name='A' parent='A'/>"), "3:1: unknown parent \"A\""},
      {inChildren("<Child kind='Props' name='A' segment='Hip'/>"), "3:1: unknown attribute \"segment\" of <Child>"},
      {inChildren(most), "read"},
      {inChildren(most + "<Child kind='Props' name='A'/>"), "67:1: one child too many, expected at most 64"},
  };
  for (const auto& [text, refusal] : templates)
    EXPECT_THAT(Refusal(ReadLabellingTemplate, text), testing::StartsWith(refusal)) << text;

  const std::pair<std::string, std::string> skins[] = {
      {File("LabellingTemplate", segments), "1:1: unknown element <LabellingTemplate>, expected SubjectSkin"},
      {File("SubjectSkin", "<Roles/>"), "1:1: <SubjectSkin> lacks an element, expected Segments"},
      {File("SubjectSkin", "<Roles>\n<Labelling/></Roles>"), "3:1: unknown element <Labelling>, expected one of Solv"},
      {File("SubjectSkin", "<ModelOutputs>\n<CGM2>1</CGM2></ModelOutputs>"), "3:1: <CGM2> is \"1\", expected true or"},
  };
  for (const auto& [text, refusal] : skins)
    EXPECT_THAT(Refusal(ReadSubjectSkin, text), testing::StartsWith(refusal)) << text;
}

}

}
