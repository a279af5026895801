#include "StandaloneHost/Server/Dispatcher.h"

#include "RunaCorePluginSubjectStore/TerminalServer2/VServerFunction.h"

#include <boost/json/parse.hpp>
#include <boost/json/serialize.hpp>
#include <gtest/gtest.h>

using namespace Server;
namespace json = boost::json;

namespace
{

constexpr TerminalServer2::ArgumentText sizeAndText[] = {{"Size", ""}, {"Text", ""}};

class DispatcherTest : public testing::Test
{
protected:
  DispatcherTest()
  {
    limits.outgoingBytes = 4000;
    limits.outgoingBytesOverall = 10000;
    limits.connections = 10;
    (void)registry.Add(2, NMX::MakeShared<TerminalServer2::VServerFunction<NMX::IResult(std::uint32_t, std::string&)>>(
                              TerminalServer2::FunctionRecord{"Group.Long", "", sizeAndText, "Ok - On success."},
                              [this](std::uint32_t size, std::string& text) -> NMX::IResult
                              {
                                ++carriedOut;
                                text.assign(size, 'x');
                                return size == 0 ? NMX::EResult::NotFound : NMX::EResult::OkButPartial;
                              },
                              nullptr));
  }

  /// The response as the codes of its parts: of results as they are, of errors with what they say of the result.
  std::string Codes(const std::string& message)
  {
    std::string text;
    dispatcher.emplace(registry, notifier, limits, outgoing, 2, "epoch");
    dispatcher->Handle(message, {}, nullptr, [&](const ResponseText& answer, std::size_t) { text = answer.Flat(); });
    EXPECT_LT(text.size(), 3 * limits.outgoingBytes);
    std::string codes;
    const json::value whole = json::parse(text);
    for (const json::value& part : whole.is_array() ? whole.get_array() : json::array{whole})
      if (const json::value* error = part.as_object().if_contains("error"))
      {
        codes += json::serialize(error->at("code"));
        if (const json::value* data = error->as_object().if_contains("data"))
          codes += '/' + json::serialize(data->at("code"));
        codes += ' ';
      }
      else
        codes += part.at("result").as_object().contains("code") ? json::serialize(part.at("result").at("code")) + ' '
                                                                : "described ";
    return codes;
  }

  static std::string Call(std::string_view size, std::string_view id = "\"id\":1,")
  {
    return "{\"jsonrpc\":\"2.0\"," + std::string(id) + "\"method\":\"Group.Long\",\"params\":[" + std::string(size) +
           "]}";
  }

  Limits limits;
  Registry registry;
  Notifier notifier{registry, limits};
  std::shared_ptr<OutgoingBytes> outgoing;
  std::optional<Dispatcher> dispatcher;
  int carriedOut = 0;

  void SetUp() override { outgoing = std::make_shared<OutgoingBytes>(limits); }
};

}

TEST_F(DispatcherTest, AnAnswerThatIsTooLongLosesItsOutputsAndEndsItsBatch)
{
  EXPECT_EQ(Codes(Call("3500")), "2 ") << "OkButPartial";
  EXPECT_EQ(Codes(Call("4000")), "-32000/2 ");
  EXPECT_EQ(Codes('[' + Call("3300") + ',' + Call("200") + ',' + Call("100") + ']'), "2 2 2 ");
  carriedOut = 0;
  EXPECT_EQ(
      Codes('[' + Call("2000") + ',' + Call("0") + ',' + Call("2000") + ',' + Call("1") + ',' + Call("1", "") + ",7]"),
      "2 -2147483638/2147483658 -32000/2 -32000 -32600 ");
  EXPECT_EQ(carriedOut, 3) << "what comes behind, answered or not, is not carried out";
  EXPECT_EQ(outgoing->Total(), 0U);
}

TEST_F(DispatcherTest, EachHasItsShareWhenTooMuchWaitsForAll)
{
  HeldBytes others(outgoing);
  others.Add(limits.outgoingBytesOverall);
  EXPECT_EQ(Codes(Call("800")), "2 ");
  EXPECT_EQ(Codes(Call("1000")), "-32000/2 ");
  EXPECT_EQ(Codes('[' + Call("400") + ',' + Call("700") + ']'), "2 -32000/2 ");
}

TEST_F(DispatcherTest, TheDescriptionTakesNoMemoryForEachWhoAsks)
{
  const std::string describe = R"({"jsonrpc":"2.0","id":1,"method":"rpc.discover"})";
  limits.outgoingBytes = 100000;
  outgoing = std::make_shared<OutgoingBytes>(limits);
  dispatcher.emplace(registry, notifier, limits, outgoing, 2, "epoch");
  dispatcher->Handle(describe, {}, nullptr,
                     [&](const ResponseText& answer, std::size_t)
                     {
                       EXPECT_LT(answer.OwnBytes(), 100U);
                       EXPECT_EQ(answer.Size(), answer.OwnBytes() + dispatcher->Api().functions->size());
                     });
  // It counts all the same where a batch grows.
  limits.outgoingBytes = dispatcher->Api().functions->size() * 5 / 2;
  outgoing = std::make_shared<OutgoingBytes>(limits);
  EXPECT_EQ(Codes('[' + describe + ',' + describe + ',' + describe + ',' + describe + ']'),
            "described described -32000/0 -32000 ");
}

TEST(ResponseText, HasItsPiecesInOrder)
{
  const auto shared = std::make_shared<const std::string>("SHARED");
  ResponseText inner("(");
  inner.Append(shared);
  inner.Append(")");
  ResponseText text("ab");
  text.Append(shared);
  text.Append(shared);
  text.Append(std::move(inner));
  text.Append(ResponseText("z"));
  const std::string flat = "abSHAREDSHARED(SHARED)z";
  EXPECT_EQ(text.Flat(), flat);
  EXPECT_EQ(text.Size(), flat.size());
  EXPECT_EQ(text.OwnBytes(), 5U);
  for (std::size_t position = 0; position <= flat.size(); ++position)
  {
    std::string rest;
    for (const std::string_view piece : text.PiecesFrom(position))
      rest += piece;
    EXPECT_EQ(rest, flat.substr(position));
  }
}
