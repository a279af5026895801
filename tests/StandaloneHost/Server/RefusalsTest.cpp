#include "StandaloneHost/Server/Refusals.h"

#include <gmock/gmock.h>

using Server::ERefusal;
using std::chrono::seconds;
using testing::ElementsAre;

TEST(Refusals, AreALineEachAndCountedWhereThereAreMany)
{
  std::vector<std::string> lines;
  Server::Refusals refusals([&](const std::string& line) { lines.push_back(line); });
  const Server::Refusals::Clock::time_point start{};
  refusals.Note(ERefusal::NoToken, "192.0.2.1", {}, start);
  refusals.Note(ERefusal::WrongHost, "192.0.2.1", "evil\x1b[2J\xff.example", start);
  for (int i = 0; i < 1000; ++i)
    refusals.Note(ERefusal::NoToken, "192.0.2.1", {}, start + seconds(1));
  refusals.Tick(start + seconds(9));
  EXPECT_THAT(lines, ElementsAre("Refused 192.0.2.1: without the right token",
                                 "Refused 192.0.2.1: under a name that is not this host's: evil?[2J?.example"));
  lines.clear();
  refusals.Tick(start + seconds(10));
  refusals.Note(ERefusal::NoToken, {}, std::string(1000, 'x'), start + seconds(19));
  refusals.Tick(start + seconds(25));
  refusals.Tick(start + seconds(60));
  EXPECT_THAT(lines,
              ElementsAre("Refused 1000 more: without the right token", "Refused 1 more: without the right token"));
  lines.clear();
  refusals.Note(ERefusal::NoToken, {}, std::string(1000, 'x'), start + seconds(90));
  EXPECT_THAT(lines, ElementsAre("Refused: without the right token: " + std::string(120, 'x')));
}
