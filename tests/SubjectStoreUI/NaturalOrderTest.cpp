#include "SubjectStoreUI/NaturalOrder.h"

#include <gmock/gmock.h>

#include <iterator>
#include <random>
#include <string>
#include <vector>

using SubjectStoreUI::CompareNaturally;
using SubjectStoreUI::NaturallyLess;
using namespace std::string_literals;

TEST(NaturalOrder, SortsAsPeopleDoAndTheirEqualsByBytes)
{
  struct Case
  {
    bool equal; ///< but for their bytes
    std::vector<std::string> ascending;
  };
  const Case cases[] = {
      {false, {"", "Subject", "Subject1", "subject2", "Subject10", "subject10a", "Subjects"}},
      {false, {"0", "2", "10", "70wand", "2000000000", "4000000000", "4294967296", "18446744073709551616", "wand"}},
      {false, {"1" + std::string(99, '0'), "1" + std::string(98, '0') + "1", "2" + std::string(99, '0')}},
      {false, {"a1b2", "a01b10", "a1b11", "a2", "a2" + "\0"s, "a2 ", "a2b", "A10"}},
      {false, {"\x01", "[", "_", "A", "Z", "\x7f", "\x80", "\xc3\x89", "\xc3\xa9", "\xff"}},
      {true, {"ZED", "Zed", "zed"}},
      {true, {"00", "0000", "000000"}},
      {true, {"A01", "A1", "a001", "a1"}},
      {true, {"x007Y9", "x007y09", "x7Y9"}},
  };
  for (const auto& [equal, texts] : cases)
    for (std::size_t i = 0; i < texts.size(); ++i)
      for (std::size_t k = 0; k < texts.size(); ++k)
      {
        const int result = CompareNaturally(texts[i], texts[k]);
        EXPECT_EQ(result < 0, !equal && i < k) << texts[i] << " and " << texts[k];
        EXPECT_EQ(result > 0, !equal && i > k) << texts[i] << " and " << texts[k];
        EXPECT_EQ(NaturallyLess(texts[i], texts[k]), i < k) << texts[i] << " and " << texts[k];
      }
}

TEST(NaturalOrder, IsATotalOrder)
{
  const std::string pieces[] = {"0", "1", "9", "00", "2000000000", "4000000000", "a", "A", "b", "_", "\xc3", "\xe9"};
  std::mt19937 random(20);
  std::vector<std::string> texts(160);
  for (std::string& text : texts)
    for (auto length = random() % 5; length > 0; --length)
      text += pieces[random() % std::size(pieces)];

  std::vector<std::vector<bool>> less(texts.size(), std::vector<bool>(texts.size()));
  for (std::size_t i = 0; i < texts.size(); ++i)
    for (std::size_t k = 0; k < texts.size(); ++k)
      less[i][k] = NaturallyLess(texts[i], texts[k]);
  for (std::size_t i = 0; i < texts.size(); ++i)
    for (std::size_t k = 0; k < texts.size(); ++k)
    {
      ASSERT_EQ(less[i][k] + less[k][i], texts[i] != texts[k]) << texts[i] << " and " << texts[k];
      for (std::size_t m = 0; m < texts.size() && less[i][k]; ++m)
        ASSERT_TRUE(less[i][m] || !less[k][m]) << texts[i] << ", " << texts[k] << ", " << texts[m];
    }
}
