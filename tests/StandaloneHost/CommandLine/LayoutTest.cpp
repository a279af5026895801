#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/CommandLine/ProgressDisplay.h"

#include <gmock/gmock.h>

using namespace CommandLine;
using testing::ElementsAre;

TEST(Layout, NothingThatSteersATerminalIsShownAsItStands)
{
  const std::pair<std::string_view, std::string_view> cases[]{{"Crate", "Crate"},
                                                              {"Kiste größer 箱 🎭", "Kiste größer 箱 🎭"},
                                                              {"a\nb\tc\rd", "a\\nb\\tc\\rd"},
                                                              {"\x1b[2J", "\\x1b[2J"},
                                                              {"\x7f", "\\x7f"},
                                                              {"\xc2\x9b"
                                                               "2J",
                                                               "\\u{9b}2J"},
                                                              {"\xe2\x80\xae"
                                                               "etarC",
                                                               "\\u{202e}etarC"},
                                                              {"a\xe2\x80\x8b", "a\\u{200b}"},
                                                              {"\xff"
                                                               "a\xc3",
                                                               "\\xffa\\xc3"},
                                                              {"\xc0\xaf", "\\xc0\\xaf"},
                                                              {std::string_view("\0", 1), "\\x00"}};
  for (const auto& [text, visible] : cases)
    EXPECT_EQ(Visible(text), visible);
  EXPECT_TRUE(IsUtf8("größer 箱"));
  EXPECT_FALSE(IsUtf8("\xff"));
  EXPECT_FALSE(IsUtf8("gr\xc3"));
  EXPECT_EQ(Columns("箱é"), 3);
  EXPECT_EQ(Columns("e\xcc\x81"), 1);
}

TEST(Layout, TextIsBrokenAtSpacesWhereThereAreAny)
{
  EXPECT_THAT(Wrap("one two three", 0), ElementsAre("one two three"));
  EXPECT_THAT(Wrap("one two three", 7), ElementsAre("one two", "three"));
  EXPECT_THAT(Wrap("one two three", 6), ElementsAre("one", "two", "three"));
  EXPECT_THAT(Wrap("abcdefgh", 3), ElementsAre("abc", "def", "gh"));
  EXPECT_THAT(Wrap("箱箱箱", 5), ElementsAre("箱箱", "箱"));
  EXPECT_THAT(Wrap("箱箱", 1), ElementsAre("箱", "箱"));
  EXPECT_THAT(Wrap("", 5), ElementsAre(""));
}

TEST(Layout, CellsStandInColumnsAndTheLastGoesOnBeneathItself)
{
  EXPECT_EQ(Table({{"1", "Größe", "x"}, {"22", "箱", ""}}, 0), "1   Größe  x\n22  箱\n");
  EXPECT_EQ(Table({{"6", "aaaa bbbb cccc dddd eeee ffff"}}, 23), "6  aaaa bbbb cccc dddd\n   eeee ffff\n");
  EXPECT_EQ(Table({{"a", "b"}, {"alone"}}, 0, 2), "  a  b\n  alone\n");
  EXPECT_EQ(Table({}, 80), "");
}

TEST(Layout, ABarIsNeverLongerThanItsWidthNorFullTooEarly)
{
  EXPECT_EQ(Bar({0, 0}, 4), "[----]   0%");
  EXPECT_EQ(Bar({1, 2}, 4), "[##--]  50%");
  EXPECT_EQ(Bar({999, 1000}, 4), "[###-]  99%");
  EXPECT_EQ(Bar({7, 5}, 4), "[####] 100%");
}
