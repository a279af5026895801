#include "StoreInterface/EntryPath.h"
#include "StoreInterface/EntryPaths.h"

#include <gtest/gtest.h>

#include <map>
#include <optional>
#include <random>
#include <thread>
#include <vector>

using NMX::EntryPath;

TEST(EntryPath, IsGivenBackWhenNobodyHoldsItAnyMore)
{
  std::optional<EntryPath> first(std::in_place, "Test/Devices/one");
  std::map<EntryPath, int> held{{*first, 1}};
  EXPECT_EQ(EntryPath("Test/Devices/one"), *first);
  first.reset();
  EXPECT_EQ(EntryPath::Known("Test/Devices/one"), held.begin()->first);
  EXPECT_EQ(held.begin()->first.Text(), "Test/Devices/one");
  const auto number = held.begin()->first.Number();
  held.clear();
  EXPECT_FALSE(EntryPath::Known("Test/Devices/one"));
  EXPECT_EQ(EntryPath("Test/Devices/two").Number(), number) << "numbers are as few as the paths that are held";

  const NMX::EntryPath constant = NMX::Paths::PathConstant<"Test/Constant">();
  EXPECT_EQ(EntryPath("Test/Constant"), constant);
  EXPECT_TRUE(EntryPath::Known("Test/Constant"));
}

/// Compares what threads hold with plain texts while others take and give back the same paths.
TEST(EntryPath, KeepsItsTextWhileOtherThreadsTakeAndGiveBackTheSame)
{
  std::vector<std::thread> threads;
  for (unsigned seed = 0; seed < 3; ++seed)
    threads.emplace_back(
        [seed]
        {
          std::mt19937 random(seed);
          std::vector<std::pair<EntryPath, std::string>> held;
          for (int round = 0; round < 20000; ++round)
          {
            std::string text = "Test/Shared/" + std::to_string(random() % 8);
            if (const auto known = EntryPath::Known(text); known && random() % 2 == 0)
              held.emplace_back(*known, text);
            else
              held.emplace_back(EntryPath(text), std::move(text));
            if (held.size() > 4)
              held.erase(held.begin() + static_cast<std::ptrdiff_t>(random() % held.size()));
            for (const auto& [path, kept] : held)
              EXPECT_EQ(path.Text(), kept);
          }
        });
  for (std::thread& thread : threads)
    thread.join();
  for (int i = 0; i < 8; ++i)
    EXPECT_FALSE(EntryPath::Known("Test/Shared/" + std::to_string(i))) << i;
}
