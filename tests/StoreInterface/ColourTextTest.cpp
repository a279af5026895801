#include "StoreInterface/ColourText.h"

#include <gtest/gtest.h>

using namespace NMX;

TEST(ColourText, ReadsBothFormsAndWritesTheLongOneInLowerCase)
{
  const struct
  {
    const char* text;
    Colour colour;
    const char* written;
  } cases[] = {
      {"#FF0000", {255, 0, 0, 255}, "#ffff0000"},
      {"#80aBcDeF", {0xAB, 0xCD, 0xEF, 0x80}, "#80abcdef"},
      {"#00000001", {0, 0, 1, 0}, "#00000001"},
  };
  for (const auto& c : cases)
  {
    Colour colour;
    EXPECT_TRUE(ColourFromText(c.text, colour).Succeeded()) << c.text;
    EXPECT_EQ(colour, c.colour) << c.text;
    EXPECT_EQ(ColourToText(colour), c.written);
  }
}

TEST(ColourText, RefusesEverythingElseAndChangesNothing)
{
  for (const char* text : {"", "#", "#ff000", "#ff0000f", "ff000000", "#ff0000000", " #ff0000", "#ff00 0", "#+f0000",
                           "#0x0000", "#gg0000", "#ff00\xc3\xa9"})
  {
    Colour colour{1, 2, 3, 4};
    EXPECT_EQ(ColourFromText(text, colour), NMX::IResult(NMX::EResult::InvalidArgument)) << text;
    EXPECT_EQ(colour, (Colour{1, 2, 3, 4})) << text;
  }
}
