#include "StandaloneHost/Characters/TemplateFile.h"

#include "tests/Support/TemporaryFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <fstream>
#include <string_view>
#include <utility>

namespace Characters
{

namespace
{

using Path = std::filesystem::path;

class CharacterTemplateFileTest : public testing::Test
{
protected:
  Path Write(std::string_view text, std::string_view name = "a.cct") const
  {
    const Path file = m_folder.Path() / name;
    std::ofstream(file, std::ios::binary) << text;
    return file;
  }

  /// The message of the error with the file's bare name, after "unreadable " when the error is of that type; "read"
  /// when there is none.
  std::string Refusal(const Path& file) const
  {
    try
    {
      (void)ReadTemplate(file);
      return "read";
    }
    catch (const Files::ConfigurationError& error)
    {
      const bool unreadable = dynamic_cast<const Files::UnreadableFileError*>(&error) != nullptr;
      return (unreadable ? "unreadable " : "") + std::string(error.what()).substr(m_folder.Path().string().size() + 1);
    }
  }

  TemporaryFolder m_folder;
};

/// A template with that content, which begins on line 2.
std::string File(std::string_view content)
{
  return "<CharacterTemplate version='1'>\n" + std::string(content) + "</CharacterTemplate>";
}

const std::string goodSegments = "<Segments><Segment name='Pelvis'/></Segments>";
const std::string goodSlots = "<Slots><Slot name='Hip' segment='Pelvis'/></Slots>";
const std::string good = File(goodSegments + goodSlots);

/// So many elements on a line each, with names of their own; `link` is the attribute that names the root.
std::string Many(int count, const std::string& element, const std::string& link)
{
  std::string text;
  for (int i = 0; i < count; ++i)
    text += '<' + element + " name='N" + std::to_string(i) + "' " + link + "='Pelvis'/>\n";
  return text;
}

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
  EXPECT_EQ(ReadTemplate(Write("\xEF\xBB\xBF<?xml version='1.0'?>" + File(segments + slots + roles))), expected);
  EXPECT_EQ(ReadTemplate(Write(File(roles + slots + segments))), expected);
  EXPECT_EQ(ReadTemplate(Write(File(slots + segments))), (CharacterTemplate{down, worn, true, false}));
}

TEST_F(CharacterTemplateFileTest, ReadsTheShippedTemplate)
{
  const CharacterTemplate biped =
      ReadTemplate(Path(SUBJECT_STORE_SOURCE_DIR) / "StandaloneHost/Characters/Templates/Biped.cct");
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
  const auto inRoles = [](const std::string& content)
  { return File(goodSegments + goodSlots + "<Roles>\n" + content + "</Roles>"); };

  const std::pair<std::string, std::string> table[] = {
      {"<SmartObjectTemplate version='1'/>", "1:1: unknown element <SmartObjectTemplate>, expected CharacterTemplate"},
      {File(goodSlots), "1:1: <CharacterTemplate> lacks an element, expected Segments"},
      {File(goodSegments), "1:1: <CharacterTemplate> lacks an element, expected Slots"},
      {File(goodSegments + "\n" + goodSlots + goodSlots), "3:51: repeated <Slots>, expected it once"},
      {File("<Segments><Segment name='Pelvis' parent=''/>"), "2:11: the first segment has a parent, expected none"},
      {inSegments("<Segment name='' parent='Pelvis'/>"), "3:1: attribute \"name\" of <Segment> is empty"},
      {inSegments("<Segment name='Pelvis' parent='Pelvis'/>"), "3:1: repeated segment \"Pelvis\", expected it once"},
      {inSegments("<Segment name='Head'/>"), "3:1: <Segment> lacks an attribute, expected \"parent\""},
      {inSegments(" <Segment name='B' parent='C'/><Segment name='C' parent='Pelvis'/>"), "3:2: unknown parent \"C\""},
      {inSegments("<Segment name='Head' parent='Head'/>"),
       "3:1: unknown parent \"Head\", expected the name of a segment that stands before"},
      {inSegments("<Segment name='Head' parent='Pelvis' mass='5'/>"), "3:1: unknown attribute \"mass\" of <Segment>"},
      {inSegments(Many(256, "Segment", "parent")), "258:1: one segment too many, expected at most 256"},
      {inSegments(Many(255, "Segment", "parent")), "read"},
      {inSlots("<Slot name='' segment='Pelvis'/>"), "3:1: attribute \"name\" of <Slot> is empty"},
      {inSlots("<Slot name='A' segment='Pelvis'/> <Slot name='A' segment='Pelvis'/>"), "3:35: repeated slot \"A\""},
      {inSlots("<Slot name='Hip' segment='Pelvis'/>\n <Slot name='Cap' segment='pelvis'/>"),
       "4:2: unknown segment \"pelvis\""},
      {inSlots("<Slot name='Hip' segment='Pelvis' object='Belt'/>"), "3:1: unknown attribute \"object\" of <Slot>"},
      {inSlots(Many(257, "Slot", "segment")), "259:1: one slot too many, expected at most 256"},
      {inSlots(Many(256, "Slot", "segment")), "read"},
      {inRoles("<Solving>1</Solving>"), "3:1: <Solving> is \"1\", expected true or false"},
  };
  for (const auto& [text, refusal] : table)
    EXPECT_THAT(Refusal(Write(text)), testing::StartsWith(refusal == "read" ? refusal : "a.cct:" + refusal)) << text;
}

TEST_F(CharacterTemplateFileTest, TellsAnUnreadableFileFromWrongContent)
{
  const std::string padding((std::size_t{1} << 20) - good.size(), ' ');
  const std::pair<Path, std::string> table[] = {
      {m_folder.Path() / "none.cct", "unreadable none.cct:1:1: the file cannot be read: No such file or directory"},
      {m_folder.Path() / ".", "unreadable .:1:1: this is a directory, expected a file"},
      {Write("", "empty.cct"), "empty.cct:1:1: the file is empty, expected XML"},
      {Write("<\xFF", "latin.cct"), "latin.cct:1:2: this is not a UTF-8 character, expected a file in UTF-8"},
      {Write("<a " + padding, "tag.cct"), "tag.cct:1:1: a tag of more than 65536 bytes"},
      {Write(good + padding, "most.cct"), "read"},
      {Write(good + padding + ' ', "large.cct"), "large.cct:1:1: the file has 1048577 bytes, expected at most 1048576"},
  };
  for (const auto& [file, refusal] : table)
    EXPECT_EQ(Refusal(file), refusal);
}

TEST_F(CharacterTemplateFileTest, TellsAFileThatItMayNotReadFromWrongContent)
{
  if (geteuid() == 0)
    GTEST_SKIP() << "root may read everything";
  const Path file = Write(good);
  std::filesystem::permissions(file, std::filesystem::perms::none);
  EXPECT_EQ(Refusal(file), "unreadable a.cct:1:1: the file cannot be read: Permission denied");
}

}

}
