#include "StandaloneHost/Server/Envelope.h"
#include "StandaloneHost/Server/JsonText.h"
#include "StandaloneHost/Server/Registry.h"

#include <gmock/gmock.h>

#include <limits>

using namespace Server;
using testing::ElementsAre;
using testing::Pair;

TEST(Envelope, TakesARequestApartWithoutTouchingItsValues)
{
  const Limits limits;
  const Message message = ReadMessage(
      " {\"id\" : 1.50 ,\"params\":  [ 18446744073709551615, {\"a\":[]} ] , \"m\\u0065thod\":\"Gr\\u00fc\\u00dfe\","
      "\"extra\":null, \"jsonrpc\":\"2.0\"} \n",
      limits);
  ASSERT_FALSE(message.complaint);
  ASSERT_EQ(message.requests.size(), 1U);
  const Request& request = message.requests[0];
  EXPECT_FALSE(request.complaint);
  EXPECT_EQ(request.method, "Gr\xC3\xBC\xC3\x9F"
                            "e");
  EXPECT_EQ(request.params, "[ 18446744073709551615, {\"a\":[]} ]");
  EXPECT_EQ(request.id, "1.50");

  EXPECT_THAT(ReadMembers("{\"A\" : \"x\" , \"B\":[1, 2] ,\"A\":3}", limits),
              ElementsAre(Pair("A", "\"x\""), Pair("B", "[1, 2]"), Pair("A", "3")));
  EXPECT_TRUE(ReadMembers("{ }", limits).empty());
}

TEST(Envelope, RefusesWhatIsNoMessage)
{
  const Limits limits;
  const std::string deep =
      "{\"jsonrpc\":\"2.0\",\"method\":\"x\",\"params\":" + std::string(40, '[') + std::string(40, ']') + "}";
  std::string huge = "[";
  for (int i = 0; i < 257; ++i)
    huge += i == 0 ? "1" : ",1";
  huge += ']';
  const std::pair<std::string, int> cases[] = {
      {"", RpcError::parse},
      {"  ", RpcError::parse},
      {"{", RpcError::parse},
      {"{\"jsonrpc\"", RpcError::parse},
      {"{\"jsonrpc\":\"2.0\",}", RpcError::parse},
      {"{\"jsonrpc\":\"2.0\",\"method\":\"x\"} x", RpcError::parse},
      {"{\"jsonrpc\":\"2.0\",\"method\":\"x\",\"id\":01}", RpcError::parse},
      {"{\"jsonrpc\":\"2.0\",\"method\":\"\xFF\"}", RpcError::parse},
      {"{\"jsonrpc\":\"2.0\",\"method\":\"\\ud800\"}", RpcError::parse},
      {"{'jsonrpc':1}", RpcError::parse},
      {"[{\"jsonrpc\":\"2.0\",\"method\":\"x\"},", RpcError::parse},
      {"[1 2]", RpcError::parse},
      {deep, RpcError::parse},
      {std::string(100000, '['), RpcError::parse},
      {std::string("{\"a\":\0}", 7), RpcError::parse},
      {"[]", RpcError::invalidRequest},
      {huge, RpcError::invalidRequest},
  };
  for (const auto& [text, code] : cases)
  {
    const Message message = ReadMessage(text, limits);
    ASSERT_TRUE(message.complaint) << text.substr(0, 80);
    EXPECT_EQ(message.complaint->code, code) << text.substr(0, 80);
  }
}

TEST(Envelope, TakesExactlyWhatIsJson)
{
  using namespace std::string_literals;
  const Limits limits;
  // The value at each of the places where a client may put one, and in a batch.
  const auto messages = [](const std::string& value)
  {
    const auto request = [](const std::string& member)
    { return "{\"jsonrpc\":\"2.0\",\"method\":\"x\"," + member + ",\"id\":1}"; };
    const std::string position = request("\"params\":[" + value + "]");
    return std::vector<std::string>{position, request("\"params\":[0,\"\"," + value + " ]"),
                                    request("\"params\":{\"A\":" + value + "}"), request("\"extra\":" + value),
                                    "[" + position + "]"};
  };
  const auto isJson = [&](const std::string& text) { return !ReadMessage(text, limits).complaint; };

  const std::string sound[] = {"0",
                               "-0",
                               "-0.0",
                               "0e0",
                               "0E+1",
                               "-1.5e-3",
                               "1e400",
                               "-1e400",
                               "1e-400",
                               "123456789012345678901234567890",
                               std::string(400, '9'),
                               "0." + std::string(400, '9'),
                               "\"\"",
                               R"("\"\\\/\b\f\n\r\t")",
                               R"("\u0000")",
                               R"("\u00e9\uD83D\ude00\uffff")",
                               "\"\x7F\"",
                               "\"\xC2\x80\xE0\xA0\x80\xED\x9F\xBF\xF0\x90\x80\x80\xF4\x8F\xBF\xBF\"",
                               "[ ]",
                               "{ }",
                               "[[],{},\t[{}]\r\n]",
                               R"({"":{"":[true,false,null]}})"};
  for (const std::string& value : sound)
    for (const std::string& text : messages(value))
      EXPECT_TRUE(isJson(text)) << text;

  std::vector<std::string> unsound = {
      // numbers
      "01", "-01", "00", "-", "--1", "+1", ".5", "-.5", "1.", "1.e1", "1e", "1e+", "1e1.5", "0x1", "1_000", "1,5.",
      "NaN", "nan", "-NaN", "Infinity", "-Infinity", "inf", "1e5e5", "0 1",
      // words
      "nul", "nulll", "True", "FALSE", "undefined", "truefalse", "t",
      // texts
      "'a'", "\"a", "a\"", "\"a\"b\"", R"("\x41")", R"("\'")", R"("\u12")", R"("\u12g4")", R"("\U0041")", R"("\ud800")",
      R"("\udc00")", R"("\ud800\ud800")", R"("\ud800\u0041")", R"("\ud800x")", R"("\udc00\ud800")", R"("\")",
      // arrays and objects
      "[1,]", "[,1]", "[1,,2]", "[1 2]", "[1;2]", "[1", "1]", "[1}", "{\"a\":1,}", "{,}", "{a:1}", "{'a':1}",
      "{\"a\" 1}", "{\"a\":}", "{\"a\"}", "{1:1}", "{\"a\":1 \"b\":2}", "{\"a\":1:2}", "{\"a\"::1}", "(1)", "{\"a\":1",
      // what stands between values
      "/*c*/1", "1//c\n", "#c\n1", "\f1", "\v1",
      "\xC2\xA0"
      "1",
      "\xEF\xBB\xBF"
      "1",
      "\0"s, "1\0"s, "\0001"s,
      // bytes that are not UTF-8: cut short, overlong, halves of a pair, beyond the last character, no first bytes
      "\"\xC3\"", "\"\xE2\x82\"", "\"\xF0\x9F\x98\"", "\"\xC0\x80\"", "\"\xC1\xBF\"", "\"\xE0\x9F\xBF\"",
      "\"\xF0\x8F\xBF\xBF\"", "\"\xED\xA0\x80\"", "\"\xED\xBF\xBF\"", "\"\xF4\x90\x80\x80\"",
      "\"\xF8\x88\x80\x80\x80\"", "\"\x80\"", "\"\xBF\"", "\"\xFE\"", "\"\xFF\"", "\"\xC3(\"", "{\"\xC3\":1}"};
  for (char control = 0; control < 0x20; ++control)
    unsound.push_back("\"a"s + control + "b\"");
  for (const std::string& value : unsound)
    for (const std::string& text : messages(value))
      EXPECT_FALSE(isJson(text)) << text;

  for (const std::string& wrong : {"\xEF\xBB\xBF"s, "\0"s, "\f"s, ","s, "//c\n"s, ")]}'\n"s, "\xFF"s})
    for (const std::string& text : {wrong + messages("0")[0], messages("0")[0] + wrong})
      EXPECT_FALSE(isJson(text)) << text;
}

TEST(Envelope, CountsNestingFromTheOutsideOfTheMessage)
{
  const Limits limits;
  const auto request = [](std::size_t depth, char open, char close)
  {
    std::string value;
    for (std::size_t i = 0; i < depth; ++i)
      value += open == '{' && i + 1 < depth ? "{\"a\":" : std::string(1, open);
    return "{\"jsonrpc\":\"2.0\",\"method\":\"x\",\"params\":" + value + std::string(depth, close) + "}";
  };
  for (const auto& [open, close] : {std::pair('[', ']'), std::pair('{', '}')})
  {
    // The request is an object already, and the batch an array.
    EXPECT_FALSE(ReadMessage(request(limits.nesting - 1, open, close), limits).complaint);
    EXPECT_TRUE(ReadMessage(request(limits.nesting, open, close), limits).complaint);
    EXPECT_FALSE(ReadMessage("[" + request(limits.nesting - 2, open, close) + "]", limits).complaint);
    EXPECT_TRUE(ReadMessage("[" + request(limits.nesting - 1, open, close) + "]", limits).complaint);
  }
}

TEST(Envelope, RefusesWhatIsNoRequestAndSaysWhy)
{
  const Limits limits;
  std::string many = "{\"jsonrpc\":\"2.0\",\"method\":\"x\",\"id\":7";
  for (int i = 0; i < 100; ++i)
    many += ",\"m" + std::to_string(i) + "\":0";
  many += '}';
  const struct
  {
    std::string text;
    const char* complaint;
    const char* id;
  } cases[] = {
      {"1", "a request must be an object", "null"},
      {"\"text\"", "a request must be an object", "null"},
      {"{}", "\"jsonrpc\" is missing", "null"},
      {"{\"jsonrpc\":\"1.0\",\"method\":\"x\",\"id\":7}", "\"jsonrpc\" must be \"2.0\"", "7"},
      {"{\"jsonrpc\":2.0,\"method\":\"x\",\"id\":7}", "\"jsonrpc\" must be \"2.0\"", "7"},
      {"{\"jsonrpc\":\"2.0\",\"id\":\"a\"}", "\"method\" is missing", "\"a\""},
      {"{\"jsonrpc\":\"2.0\",\"method\":1,\"id\":7}", "\"method\" must be a string", "7"},
      {"{\"jsonrpc\":\"2.0\",\"method\":\"x\",\"params\":1}", "\"params\" must be an array or an object", "null"},
      {"{\"jsonrpc\":\"2.0\",\"method\":\"x\",\"id\":{}}", "\"id\" must be a string, a number or null", "null"},
      {"{\"jsonrpc\":\"2.0\",\"method\":\"x\",\"id\":true}", "\"id\" must be a string, a number or null", "null"},
      {"{\"jsonrpc\":\"2.0\",\"method\":\"x\",\"method\":\"y\",\"id\":7}", "\"method\" is given twice", "7"},
      {many, "a request of more than 16 members", "7"},
  };
  for (const auto& c : cases)
  {
    const Message message = ReadMessage(c.text, limits);
    ASSERT_EQ(message.requests.size(), 1U) << c.text;
    ASSERT_TRUE(message.requests[0].complaint) << c.text;
    EXPECT_EQ(message.requests[0].complaint->text, c.complaint);
    EXPECT_EQ(message.requests[0].complaint->code, RpcError::invalidRequest);
    EXPECT_EQ(message.requests[0].id, c.id) << c.text;
  }
}

TEST(JsonText, WritesValuesThatReadBackTheSame)
{
  std::string json;
  AppendString(json, std::string_view("\"\\/\b\f\n\r\t\x01\x1F\x7F\0 \xC3\xA9\xF0\x9F\x98\x80", 19));
  EXPECT_EQ(json, "\"\\\"\\\\/\\u0008\\u000c\\n\\r\\t\\u0001\\u001f\x7F\\u0000 \xC3\xA9\xF0\x9F\x98\x80\"");

  const std::pair<double, const char*> numbers[] = {
      {0.1, "0.1"},
      {5, "5"},
      {-2.5, "-2.5"},
      {1e300, "1e+300"},
      {std::numeric_limits<double>::infinity(), "1.7976931348623157e+308"},
      {-std::numeric_limits<double>::infinity(), "-1.7976931348623157e+308"}};
  for (const auto& [number, text] : numbers)
  {
    std::string written;
    AppendNumber(written, number);
    EXPECT_EQ(written, text);
  }

  const std::string_view names[] = {"Set", "Warnings", "Empty", "Big"};
  const std::pair<std::uint32_t, std::string_view> warnings[] = {{5, "five"}, {11, "eleven"}};
  std::string members;
  MemberWriter writer(members, names);
  writer.TextSet({"b", "a"});
  writer.WarningMap(warnings);
  writer.TextList({});
  writer.UInt64(18446744073709551615ULL);
  EXPECT_EQ(members, R"("Set":["a","b"],"Warnings":[[5,"five"],[11,"eleven"]],"Empty":[],"Big":18446744073709551615)");
}

TEST(Registry, FindsTheMeaningOfCodesInTheDocumentation)
{
  const auto texts = ReadResultTexts("Ok - On success.\nNotFound - No - such - name.\nTrue - If so.\n"
                                     "SerializationFailure - Not parsed\nno separator\n");
  EXPECT_THAT(texts, ElementsAre(Pair(NMX::IResult(NMX::EResult::Ok), "On success."),
                                 Pair(NMX::IResult(NMX::EResult::NotFound), "No - such - name."),
                                 Pair(NMX::IResult(NMX::EResult::SerialisationFailure), "Not parsed")));
  EXPECT_EQ(NMX::IResult(NMX::EResult::RPCNotConnected).Code(), 0x8000002EU);
  EXPECT_EQ(NMX::IResult(NMX::EResult::FileNotFound).Code(), 0x8000002AU);
  EXPECT_EQ(NMX::IResult(0x8000000AU).Name(), "NotFound");
  EXPECT_EQ(NMX::IResult(0x8000002FU).Name(), "");
}
