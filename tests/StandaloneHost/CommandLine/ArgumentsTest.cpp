#include "StandaloneHost/CommandLine/Arguments.h"
#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Names.h"
#include "StandaloneHost/CommandLine/Target.h"

#include <gmock/gmock.h>

using namespace CommandLine;
using testing::ElementsAre;
using testing::HasSubstr;

namespace
{

Description Stage()
{
  Description description;
  description.enumerations.push_back({"G.EState", "", "G", {{"0", "None", ""}, {"3", "Done", ""}}, ""});
  return description;
}

Function MakeFunction(std::vector<Argument> inputs)
{
  Function function;
  function.name = "G.Set";
  function.inputs = std::move(inputs);
  return function;
}

/// What the operation complains of; empty when it does not.
template <class Operation>
std::string Complaint(Operation operation)
{
  try
  {
    (void)operation();
    return {};
  }
  catch (const CommandError& failure)
  {
    EXPECT_EQ(failure.Status(), EStatus::Usage);
    return failure.what();
  }
}

}

TEST(Arguments, WordsAreTypedByTheDescription)
{
  const Description description = Stage();
  const auto typed = [&](EType type, std::string_view word)
  {
    try
    {
      return ArgumentJson({"X", "", type, "G.EState"}, word, description);
    }
    catch (const CommandError& failure)
    {
      EXPECT_THAT(failure.what(), HasSubstr("\"X\": expected"));
      return std::string("refused");
    }
  };
  const std::tuple<EType, std::string_view, std::string_view> cases[]{
      {EType::Truth, "true", "true"},
      {EType::Truth, "1", "refused"},
      {EType::WholeNumber, "18446744073709551615", "18446744073709551615"},
      {EType::WholeNumber, "-0012", "-12"},
      {EType::WholeNumber, "000", "0"},
      {EType::WholeNumber, "1.5", "refused"},
      {EType::WholeNumber, "", "refused"},
      {EType::WholeNumber, "-", "refused"},
      {EType::Number, "0.10", "0.10"},
      {EType::Number, "1e3", "1e3"},
      {EType::Number, "007", "7"},
      {EType::Number, "nan", "refused"},
      {EType::Number, "1, 2", "refused"},
      {EType::Text, "true", "\"true\""},
      {EType::Text, "a\"b\n", R"("a\"b\n")"},
      {EType::Text, "\xff", "refused"},
      {EType::TextList, "", "[]"},
      {EType::TextList, "a,b c,", R"(["a","b c",""])"},
      {EType::TextSet, R"(["a,b"])", R"(["a,b"])"},
      {EType::TextList, "[1]", "refused"},
      {EType::TextList, "[", "refused"},
      {EType::Enumeration, "done", "3"},
      {EType::Enumeration, "7", "7"},
      {EType::Enumeration, "gone", "refused"},
      {EType::Other, "{\"a\" :1}", "{\"a\":1}"},
      {EType::Other, "{", "refused"}};
  for (const auto& [type, word, json] : cases)
    EXPECT_EQ(typed(type, word), json) << word;
}

TEST(Arguments, WordsStandByPositionOrByName)
{
  const Function function = MakeFunction({{"Name", "", EType::Text, ""}, {"Count", "", EType::WholeNumber, ""}});
  const auto read = [&](std::vector<std::string> words) { return ReadInputs(function, words, {}); };
  EXPECT_THAT(read({"a", "2"}), ElementsAre("\"a\"", "2"));
  EXPECT_THAT(read({"Count=2", "a"}), ElementsAre("\"a\"", "2"));
  EXPECT_THAT(read({"x=y", "2"}), ElementsAre("\"x=y\"", "2"));
  EXPECT_THAT(read({"Name=Name=y", "Count=2"}), ElementsAre("\"Name=y\"", "2"));
  EXPECT_THAT(Complaint([&] { return read({"a"}); }), HasSubstr("\"Count\" is missing: call G.Set Name Count"));
  EXPECT_THAT(Complaint([&] { return read({"a", "2", "3"}); }), HasSubstr("too many"));
  EXPECT_THAT(Complaint([&] { return read({"a", "Name=b"}); }), HasSubstr("\"Name\" is given twice"));
}

TEST(Arguments, ANameMayBeShortButNotAmbiguous)
{
  const std::vector<std::string> names{"A.Color", "A.SetColor", "B.SetColor", "B.State", "B.STATE"};
  const auto resolve = [&](std::string_view given) { return ResolveName(given, names, "function"); };
  EXPECT_EQ(resolve("A.SetColor"), "A.SetColor");
  EXPECT_EQ(resolve("b.setcolor"), "B.SetColor");
  EXPECT_EQ(resolve("color"), "A.Color");
  EXPECT_EQ(resolve("State"), "B.State");
  EXPECT_THAT(Complaint([&] { return resolve("SetColor"); }), HasSubstr("could be A.SetColor, B.SetColor"));
  EXPECT_THAT(Complaint([&] { return resolve("state"); }), HasSubstr("could be B.State, B.STATE"));
  EXPECT_THAT(Complaint([&] { return resolve("A.Colour"); }), HasSubstr("did you mean A.Color"));
  EXPECT_THAT(Complaint([&] { return resolve("Frobnicate"); }), HasSubstr("there is no function \"Frobnicate\""));
  EXPECT_THAT(Complaint([&] { return resolve(std::string(100000, 'x')); }), HasSubstr("…"));
}

TEST(Arguments, AServerIsAnAddressAndNothingMore)
{
  const std::pair<const char*, const char*> good[]{{"http://127.0.0.1:8420", "http://127.0.0.1:8420"},
                                                   {"ws://localhost:1/rpc", "http://localhost:1"},
                                                   {"WSS://[::1]:65535/", "https://[::1]:65535"},
                                                   {"https://stage.example", "https://stage.example:443"}};
  for (const auto& [url, meant] : good)
    EXPECT_EQ(ParseServer(url).Url(), meant);
  for (const char* bad : {"", "127.0.0.1:8420", "ftp://a", "http://", "http://a:0", "http://a:65536", "http://u:p@a",
                          "http://a/other", "http://a\r\nX: y", "http://[zz]"})
    EXPECT_THAT(Complaint([&] { return ParseServer(bad); }), HasSubstr("--server")) << bad;
}
