#include "StandaloneHost/Characters/TemplateFile.h"

#include "tests/Support/TemplateFixture.h"

#include <sys/syscall.h>
#include <thread>
#include <unistd.h>

namespace Characters
{

namespace
{

class CharacterTemplateFileTest : public TemplateFixture
{
protected:
  static std::string File(const std::string& content) { return TemplateFixture::File("CharacterTemplate", content); }
};

const std::string goodSegments = "<Segments><Segment name='Pelvis'/></Segments>";
const std::string goodSlots = "<Slots><Slot name='Hip' segment='Pelvis'/></Slots>";

TEST_F(CharacterTemplateFileTest, ReadsEverythingInItsOrderWhicheverSectionIsFirst)
{
  const std::string segments = "<Segments><Segment name='Pelvis'/><!-- down -->\n <Segment parent='Pelvis' "
                               "name='F&#252;sse'/><Segment name='Toe' parent='F\xC3\xBCsse'></Segment></Segments>";
  const std::string slots = "<Slots><Slot name='\xC3\x98Z' segment='Toe'/><Slot segment='F\xC3\xBCsse' name='B'/>"
                            "<Slot name='A' segment='Toe'/></Slots>";
  const std::string roles = "<Roles><Retargeting>true</Retargeting><Solving>false</Solving></Roles>\r\n";
  const decltype(CharacterTemplate::segments) down{{"Pelvis", ""}, {"F\xC3\xBCsse", "Pelvis"}, {"Toe", "F\xC3\xBCsse"}};
  const decltype(CharacterTemplate::slots) worn{{"\xC3\x98Z", "Toe"}, {"B", "F\xC3\xBCsse"}, {"A", "Toe"}};
  const CharacterTemplate expected{down, worn, false, true};
  EXPECT_EQ(ReadTemplate(Write(File(segments + slots + roles))), expected);
  EXPECT_EQ(ReadTemplate(Write(File(roles + slots + segments))), expected);
  EXPECT_EQ(ReadTemplate(Write(File(slots + segments))), (CharacterTemplate{down, worn, true, false}));
}

TEST_F(CharacterTemplateFileTest, ReadsTheShippedTemplate)
{
  const CharacterTemplate biped = ReadTemplate(m_shipped / "Characters/Templates/Biped.cct");
  EXPECT_EQ(biped.segments.front(), (Files::Segment{"Pelvis", ""}));
  EXPECT_THAT(biped.segments, testing::Contains(Files::Segment{"RightFoot", "RightShin"}));
  EXPECT_EQ(biped.slots.front(), (SlotTemplate{"Pelvis", "Pelvis"}));
  EXPECT_THAT(biped.slots, testing::Each(testing::Truly([](const SlotTemplate& s) { return s.name == s.segment; })));
}

TEST_F(CharacterTemplateFileTest, RefusesMalformedFilesAndTellsWhere)
{
  // Sound but for the content, which begins on line 3
  const auto inSegments = [](const std::string& content)
  { return File("<Segments><Segment name='Pelvis'/>\n" + content + "</Segments>" + goodSlots); };
  const auto inSlots = [](const std::string& content)
  { return File("<Slots>\n" + content + "</Slots>" + goodSegments); };
  const auto manySegments = [&](int count)
  { return inSegments(Many(count, "<Segment parent='Pelvis' name='N", "'/>")); };
  const auto manySlots = [&](int count) { return inSlots(Many(count, "<Slot segment='Pelvis' name='N", "'/>")); };

  ExpectRefusals(
      ReadTemplate,
      {
          {std::string((1 << 20) + 1, ' '), "1:1: the file has 1048577 bytes, expected at most 1048576"},
          {File(goodSegments + goodSlots) + "\n<a/>", "3:1: not well-formed XML"},
          {"<SmartObjectTemplate version='1'/>", "1:1: unknown element <SmartObjectTemplate>, expected Character"},
          {"<CharacterTemplate version='2'/>", "1:1: the version is \"2\", expected 1"},
          {File(goodSlots), "1:1: <CharacterTemplate> lacks an element, expected Segments"},
          {File(goodSegments), "1:1: <CharacterTemplate> lacks an element, expected Slots"},
          {File("<Segments><Segment name='Pelvis' parent=''/>"), "2:11: the first segment has a parent, expected none"},
          {inSegments("<Segment name='' parent='Pelvis'/>"), "3:1: attribute \"name\" of <Segment> is empty"},
          {inSegments("<Segment name='Pelvis' parent='Pelvis'/>"),
           "3:1: repeated segment \"Pelvis\", expected it once"},
          {inSegments("<Segment name='Head'/>"), "3:1: <Segment> lacks an attribute, expected \"parent\""},
          {inSegments(" <Segment name='B' parent='C'/><Segment name='C' parent='Pelvis'/>"),
           "3:2: unknown parent \"C\""},
          {inSegments("<Segment name='Head' parent='Head'/>"), "3:1: unknown parent \"Head\", expected the name of a"},
          {inSegments("<Segment name='Head' parent='Pelvis' mass='5'/>"),
           "3:1: unknown attribute \"mass\" of <Segment>"},
          {inSegments("<Segment name='Head' parent='Pelvis'>\n<a/></Segment>"), "4:1: unknown element <a>"},
          {manySegments(255), "read"},
          {manySegments(256), "258:1: one segment too many, expected at most 256"},
          {inSlots("<Slot name='' segment='Pelvis'/>"), "3:1: attribute \"name\" of <Slot> is empty"},
          {inSlots("<Slot name='A' segment='Pelvis'/> <Slot name='A' segment='Pelvis'/>"), "3:35: repeated slot \"A\""},
          {inSlots("<Slot name='A' segment='Pelvis'/>\n <Slot name='B' segment='pelvis'/>"),
           "4:2: unknown segment \"pelvis\""},
          {inSlots("<Slot name='Hip' segment='Pelvis' object='Belt'/>"), "3:1: unknown attribute \"object\" of <Slot>"},
          {inSlots("<Slot name='Hip' segment='Pelvis'>\n<a/></Slot>"), "4:1: unknown element <a>"},
          {manySlots(256), "read"},
          {manySlots(257), "259:1: one slot too many, expected at most 256"},
          {File(goodSegments + goodSlots + "<Roles>\n<Solving>1</Solving></Roles>"),
           "3:1: <Solving> is \"1\", expected"},
      });
}

TEST_F(CharacterTemplateFileTest, TellsAFileThatItMayNotReadFromWrongContent)
{
  const auto file = Write(File(goodSegments + goodSlots));
  std::filesystem::permissions(file.parent_path(), std::filesystem::perms{0755});
  // Root may read every file: another user tries. Each thread has a user of its own.
  std::string refusal;
  std::thread(
      [&]
      {
        std::filesystem::permissions(file, std::filesystem::perms::none);
        if (geteuid() == 0)
        {
          ASSERT_EQ(syscall(SYS_setresuid, -1, 65534, -1), 0);
        }
        refusal = Refusal(ReadTemplate, file);
      })
      .join();
  EXPECT_EQ(refusal, "unreadable 1:1: the file cannot be read: Permission denied");
}

}

}
