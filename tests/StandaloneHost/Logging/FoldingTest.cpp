#include "StandaloneHost/Logging/Folding.h"

#include <gmock/gmock.h>

using Logging::Folding;
using NMX::ESeverity;
using testing::AllOf;
using testing::ElementsAre;
using testing::Field;
using testing::IsEmpty;
using testing::MatchesRegex;
using namespace std::chrono_literals;

namespace
{

struct LogFolding : public testing::Test
{
  bool Passes(const std::string& text, unsigned line = 1, ESeverity severity = ESeverity::Error,
              std::string_view channel = "System", std::string_view file = "File.cpp")
  {
    return folding.Passes({channel, severity, text, file, line}, now);
  }

  /// How many of so many messages of one place pass, each with another text.
  int Passed(int count, std::size_t size = 36)
  {
    int passed = 0;
    for (int i = 0; i < count; ++i)
      passed += Passes(std::to_string(i) + std::string(size, 'x'));
    return passed;
  }

  Folding folding;
  Folding::Clock::time_point now = Folding::Clock::now();
};

}

TEST_F(LogFolding, LetsABurstOfAPlacePassAndThenAFewBytesASecondWhateverTheTexts)
{
  const int burst = Passed(10000);
  EXPECT_GT(burst, 100);
  EXPECT_LT(burst, 200);
  EXPECT_EQ(Passed(1000), 0);
  now += 10s;
  EXPECT_NEAR(Passed(1000), 10, 2);
  now += 24h;
  EXPECT_EQ(Passed(10000), burst);
}

TEST_F(LogFolding, LetsFewerLongMessagesPassThanShortOnesAndTheFirstHoweverLongItIs)
{
  EXPECT_TRUE(Passes(std::string(1 << 20, 'x')));
  EXPECT_LT(Passed(1000, 5000), 10);
}

TEST_F(LogFolding, LetsTheSameTextPassOnceInAWhile)
{
  EXPECT_TRUE(Passes("the same"));
  EXPECT_FALSE(Passes("the same"));
  EXPECT_TRUE(Passes("another"));
  EXPECT_TRUE(Passes("the same"));
  now += 9s;
  EXPECT_FALSE(Passes("the same"));
  EXPECT_THAT(folding.Reports(now + 1s),
              ElementsAre(Field(&Folding::Report::text, "Left out 2 more like this in 10 s: the same")));
  now += 10s;
  EXPECT_TRUE(Passes("the same"));
}

TEST_F(LogFolding, TellsPlacesApartByAllThatNamesThem)
{
  Passed(10000);
  EXPECT_FALSE(Passes("text"));
  EXPECT_TRUE(Passes("text", 2));
  EXPECT_TRUE(Passes("text", 1, ESeverity::Notice));
  EXPECT_TRUE(Passes("text", 1, ESeverity::Error, "Server"));
  EXPECT_TRUE(Passes("text", 1, ESeverity::Error, "System", "Other.cpp"));
}

TEST_F(LogFolding, ReportsWhatWasHeldBackOnceAndInTime)
{
  const auto report = [](const char* text)
  {
    return AllOf(Field(&Folding::Report::channel, "System"), Field(&Folding::Report::severity, ESeverity::Error),
                 Field(&Folding::Report::text, MatchesRegex(text)));
  };
  const int burst = Passed(10000);
  EXPECT_EQ(folding.NextReport(), now + Folding::reportTime);
  EXPECT_THAT(folding.Reports(now + 9s), IsEmpty());
  now += 10s;
  const std::string first =
      "Left out " + std::to_string(10000 - burst) + " more like this in 10 s: " + std::to_string(burst) + "x+";
  EXPECT_THAT(folding.Reports(now), ElementsAre(report(first.c_str())));
  EXPECT_EQ(folding.NextReport(), std::nullopt);
  EXPECT_THAT(folding.Reports(now + 1h), IsEmpty());

  // A second place, later: each has its time, and the end waits for neither.
  Passed(1000, 300);
  now += 5s;
  while (Passes("elsewhere", 2))
    ;
  EXPECT_EQ(folding.NextReport(), now + 5s);
  EXPECT_EQ(folding.Reports(now + 5s).size(), 1U);
  EXPECT_EQ(folding.NextReport(), now + 10s);
  EXPECT_THAT(folding.Reports(now, true), ElementsAre(report("Left out 1 more like this in 0 s: elsewhere")));
}

TEST_F(LogFolding, KeepsNoMoreThanItsPlacesHoweverManyAreMadeUp)
{
  int passed = 0;
  for (unsigned line = 0; line < 10000; ++line)
    passed += Passes("made up", line);
  EXPECT_GT(passed, 500);
  EXPECT_LT(passed, 1000);
}
