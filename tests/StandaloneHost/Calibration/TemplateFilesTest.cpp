#include "StandaloneHost/Calibration/LabellingTemplateFile.h"
#include "StandaloneHost/Calibration/SubjectSkinFile.h"

#include "tests/Support/TemplateFixture.h"

namespace Calibration
{

namespace
{

using NMX::ESubjectKind;
using CalibrationTemplateFilesTest = TemplateFixture;

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
  const LabellingTemplate performer = ReadLabellingTemplate(m_shipped / "Calibration/Templates/Performer.lbt");
  EXPECT_EQ(performer.segments.size(), 21U);
  EXPECT_TRUE(performer.children.empty());
  EXPECT_THAT(ReadLabellingTemplate(m_shipped / "Calibration/Templates/Performer with staff.lbt").children,
              testing::ElementsAre(ChildTemplate{ESubjectKind::Props, "Staff", ""},
                                   ChildTemplate{ESubjectKind::LabellingClusters, "Staff head", "Staff"}));
  EXPECT_EQ(ReadSubjectSkin(m_shipped / "Calibration/Skins/Adult.skin"),
            (SubjectSkin{performer.segments, true, true, true, false}));
  EXPECT_EQ(ReadSubjectSkin(m_shipped / "Calibration/Skins/Child.skin").segments.size(), 16U);
}

TEST_F(CalibrationTemplateFilesTest, RefusesMalformedFilesAndTellsWhere)
{
  // Sound but for the children, which begin on line 3
  const auto inChildren = [](const std::string& content)
  { return File("LabellingTemplate", segments + "<Children>\n" + content + "</Children>"); };
  const auto many = [&](int count) { return inChildren(Many(count, "<Child kind='Props' name='", "'/>")); };
  const std::string tooLarge((1 << 20) + 1, ' ');

  ExpectRefusals(
      ReadLabellingTemplate,
      {
          {tooLarge, "1:1: the file has 1048577 bytes, expected at most 1048576"},
          {File("LabellingTemplate", segments) + "\n<a/>", "3:1: not well-formed XML"},
          {File("SubjectSkin", segments), "1:1: unknown element <SubjectSkin>, expected LabellingTemplate"},
          {"<LabellingTemplate version='2'/>", "1:1: the version is \"2\", expected 1"},
          {File("LabellingTemplate", "<Roles/>"), "1:1: <LabellingTemplate> lacks an element, expected Segments"},
          {inChildren(""), "2:77: <Children> is empty, expected at least one Child"},
          {inChildren("<Child name='A'/>"), "3:1: <Child> lacks an attribute, expected \"kind\""},
          {inChildren("<Child kind='CFCs' name='A'/>"), "3:1: the kind is \"CFCs\", expected one of Props, Labelling"},
          {inChildren("<Child kind='Props' name=''/>"), "3:1: attribute \"name\" of <Child> is empty"},
          {inChildren("<Child kind='Props' name='A'/>\n <Child kind='LabellingClusters' name='A' parent='A'/>"),
           "4:2: repeated child \"A\", expected it once"},
          {inChildren("<Child kind='Props' name='A' parent=''/>"), "3:1: attribute \"parent\" of <Child> is empty"},
          {inChildren("<Child kind='Props' name='A' parent='Hip'/>"), "3:1: unknown parent \"Hip\", expected the name"},
          {inChildren("<Child kind='Props' name='A' parent='A'/>"), "3:1: unknown parent \"A\""},
          {inChildren("<Child kind='Props' name='A' segment='Hip'/>"), "3:1: unknown attribute \"segment\" of <Child>"},
          {inChildren("<Child kind='Props' name='A'>\n<a/></Child>"), "4:1: unknown element <a>"},
          {many(64), "read"},
          {many(65), "67:1: one child too many, expected at most 64"},
      });
  ExpectRefusals(ReadSubjectSkin,
                 {
                     {tooLarge, "1:1: the file has 1048577 bytes, expected at most 1048576"},
                     {File("SubjectSkin", segments) + "\n<a/>", "3:1: not well-formed XML"},
                     {File("LabellingTemplate", segments), "1:1: unknown element <LabellingTemplate>, expected Subj"},
                     {"<SubjectSkin version='2'/>", "1:1: the version is \"2\", expected 1"},
                     {File("SubjectSkin", "<Roles/>"), "1:1: <SubjectSkin> lacks an element, expected Segments"},
                 });
}

}

}
