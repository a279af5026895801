#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/CommandLine/ProgressDisplay.h"

#include <gmock/gmock.h>

using namespace CommandLine;
using testing::ElementsAre;

TEST(Layout, TextIsMeasuredInColumnsAndShownAsText)
{
  EXPECT_EQ(Visible("Kiste\n\x1b[2J"), "Kiste\\n\\x1b[2J");
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
