#include "RunaCorePluginSubjectStore/TerminalServer2/VServerFunction.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"

#include <gmock/gmock.h>

#include <limits>
#include <optional>
#include <stdexcept>
#include <thread>

using NMX::EResult;
using NMX::IResult;
using namespace TerminalServer2;

namespace
{

constexpr ArgumentText texts[] = {{"Name", ""}, {"Flag", ""}, {"Count", ""}, {"Factor", ""}, {"Big", ""}, {"Sum", ""}};

using Signature = IResult(const std::string&, bool, std::uint32_t, double, std::uint64_t, std::string&);

const FunctionRecord record{"Group.Function", "", texts, ""};

/// What a call was finished with, and how often.
struct Finished
{
  int times = 0;
  IResult result;
  std::string text;
  std::string output;

  NMX::IServerFunction::Completion Completion()
  {
    return [this](const NMX::IServerReply& reply)
    {
      struct Writer final : IValueWriter
      {
        explicit Writer(std::string& target) : text(target) {}
        void Bool(bool) override {}
        void UInt32(std::uint32_t) override {}
        void UInt64(std::uint64_t) override {}
        void Double(double) override {}
        void Text(std::string_view value) override { text += value; }
        void TextSet(const std::set<std::string>&) override {}
        void TextList(const std::vector<std::string>&) override {}
        void WarningMap(std::span<const Warning>) override {}
        std::string& text;
      };
      ++times;
      result = reply.Result();
      text = reply.Text();
      Writer writer(output);
      reply.WriteOutputs(writer);
    };
  }
};

class ServerFunctionTest : public testing::Test
{
protected:
  void Make(VServerFunction<Signature>::Callable callable, std::shared_ptr<NMX::IPostalService> service)
  {
    const auto queue = service ? std::make_shared<CallQueue>(std::move(service)) : nullptr;
    function = NMX::MakeShared<VServerFunction<Signature>>(record, std::move(callable), queue);
  }

  /// Calls and returns what was left of the text.
  std::string Call(std::string_view text)
  {
    function->Invoke(text, NMX::Caller{}, finished.Completion());
    return std::string(text);
  }

  IResult Echo(const std::string& name, bool flag, std::uint32_t count, double factor, std::uint64_t big,
               std::string& sum)
  {
    ++calls;
    lastFactor = factor;
    sum = name + '|' + std::to_string(flag) + '|' + std::to_string(count) + '|' + std::to_string(factor) + '|' +
          std::to_string(big);
    return EResult::Ok;
  }

  VServerFunction<Signature>::Callable EchoCallable()
  {
    return [this](auto&&... arguments) { return Echo(arguments...); };
  }

  std::shared_ptr<ManualPostal> postal = std::make_shared<ManualPostal>();
  std::shared_ptr<VServerFunction<Signature>> function;
  Finished finished;
  int calls = 0;
  double lastFactor = 0;
};

}

TEST_F(ServerFunctionTest, ReadsEveryTypeAndStepsPastTheArrayOnly)
{
  Make(EchoCallable(), nullptr);
  EXPECT_EQ(
      Call(" \t\r\n[ \"caf\\u00e9 \\ud83d\\ude00\\n\" ,true , 4294967295,-2.5e1 , 18446744073709551615 ] ,\"id\":1}"),
      " ,\"id\":1}");
  EXPECT_EQ(finished.times, 1);
  EXPECT_EQ(finished.result, IResult(EResult::Ok));
  EXPECT_EQ(finished.output, "caf\xC3\xA9 \xF0\x9F\x98\x80\n|1|4294967295|-25.000000|18446744073709551615");

  // However an integer is written, it is the same number, to the last digit.
  for (const auto& [text, number] : {std::pair{"70e-1", "7"},
                                     {"-0.0", "0"},
                                     {"0e999", "0"},
                                     {"9007199254740993.0", "9007199254740993"},
                                     {"0.9007199254740993e+16", "9007199254740993"},
                                     {"18446744073709551615e0", "18446744073709551615"},
                                     {"1844674407370955161500.00e-2", "18446744073709551615"},
                                     {"1000000000000000000000000000000e-30", "1"}})
  {
    finished = {};
    EXPECT_EQ(Call("[\"\",false,1.0,3," + std::string(text) + "]"), "") << text;
    EXPECT_EQ(finished.output, "|0|1|3.000000|" + std::string(number)) << text;
  }

  // Exactly the number that is nearest to what is written.
  for (const auto& [text, number] : {std::pair{"234.20657862927774", 234.20657862927774},
                                     {"2.5", 2.5},
                                     {"5e-324", 5e-324},
                                     {"1e-400", 0.0},
                                     {"9007199254740993", 9007199254740992.0}})
  {
    (void)Call("[\"\",false,1, " + std::string(text) + " ,7]");
    EXPECT_EQ(lastFactor, number) << text;
  }
}

TEST_F(ServerFunctionTest, RefusesWhatDoesNotFitBeforeTheServiceIsAsked)
{
  struct Case
  {
    const char* text;
    EResult result;
    const char* complaint;
  };
  const std::string deep = std::string(100000, '[');
  constexpr const char* big = "argument 5 \"Big\": expected a whole number from 0 to 18446744073709551615";
  const Case cases[] = {
      {"", EResult::EndOfData, "expected an array of arguments"},
      {" \t\r\n", EResult::EndOfData, "expected an array of arguments"},
      {"{}", EResult::InvalidFormat, "expected an array of arguments"},
      {"x", EResult::InvalidFormat, "expected an array of arguments"},
      {"[", EResult::EndOfData, "argument 1 \"Name\": expected a text"},
      {"[]", EResult::InvalidFormat, "argument 1 \"Name\": expected a text"},
      {"[\"unfinished", EResult::EndOfData, "argument 1 \"Name\": expected a text"},
      {"[\"bad \\x escape\"", EResult::InvalidFormat, "argument 1 \"Name\": expected a text"},
      {"[\"lone \\ud800 surrogate\"", EResult::InvalidFormat, "argument 1 \"Name\": expected a text"},
      {"[\"not \xFF UTF-8\"", EResult::InvalidFormat, "argument 1 \"Name\": expected a text"},
      {"[null", EResult::InvalidFormat, "argument 1 \"Name\": expected a text"},
      {"[\"a\"", EResult::EndOfData, "argument 2 \"Flag\": expected true or false"},
      {"[\"a\" true", EResult::InvalidFormat, "argument 2 \"Flag\": expected true or false"},
      {"[\"a\",1", EResult::InvalidFormat, "argument 2 \"Flag\": expected true or false"},
      {"[\"a\",tru", EResult::EndOfData, "argument 2 \"Flag\": expected true or false"},
      {"[\"a\",true,\"1\"", EResult::InvalidFormat,
       "argument 3 \"Count\": expected a whole number from 0 to 4294967295"},
      {"[\"a\",true,-1", EResult::InvalidValue, "argument 3 \"Count\": expected a whole number from 0 to 4294967295"},
      {"[\"a\",true,1.5", EResult::InvalidValue, "argument 3 \"Count\": expected a whole number from 0 to 4294967295"},
      {"[\"a\",true,4294967296", EResult::InvalidValue,
       "argument 3 \"Count\": expected a whole number from 0 to 4294967295"},
      {"[\"a\",true,1,1e999", EResult::InvalidValue, "argument 4 \"Factor\": expected a number"},
      {"[\"a\",true,1,NaN", EResult::InvalidFormat, "argument 4 \"Factor\": expected a number"},
      {"[\"a\",true,1,1,18446744073709551616", EResult::InvalidValue, big},
      {"[\"a\",true,1,1,18446744073709551615.5", EResult::InvalidValue, big},
      {"[\"a\",true,1,1,1844674407370955161.6e1", EResult::InvalidValue, big},
      {"[\"a\",true,1,1,9007199254740993.000000001", EResult::InvalidValue, big},
      {"[\"a\",true,1,1,-9007199254740993.0", EResult::InvalidValue, big},
      {"[\"a\",true,1,1,1e20", EResult::InvalidValue, big},
      {"[\"a\",true,1,1,1e-400", EResult::InvalidValue, big},
      {"[\"a\",true,1,1,1", EResult::EndOfData, "after 5 arguments: expected no further argument"},
      {"[\"a\",true,1,1,1,1]", EResult::InvalidFormat, "after 5 arguments: expected no further argument"},
      {"[\"a\",true,1,1,1}", EResult::InvalidFormat, "after 5 arguments: expected no further argument"},
      {deep.c_str(), EResult::InvalidFormat, "argument 1 \"Name\": expected a text"},
  };
  for (const Case& c : cases)
  {
    Make(EchoCallable(), postal);
    finished = {};
    Call(c.text);
    const std::string shown = std::string(c.text).substr(0, 60);
    EXPECT_EQ(finished.times, 1) << shown;
    EXPECT_EQ(finished.result, IResult(c.result)) << shown;
    EXPECT_EQ(finished.text, c.complaint) << shown;
  }
  postal->RunAll();
  EXPECT_EQ(calls, 0);
}

TEST_F(ServerFunctionTest, RunsOnItsPostalServiceAndNeverInsideInvoke)
{
  Make(EchoCallable(), postal);
  Call(R"(["a",true,1,1,1])");
  EXPECT_EQ(calls, 0);
  EXPECT_EQ(finished.times, 0);
  EXPECT_EQ(postal->RunAll(), 1);
  EXPECT_EQ(calls, 1);
  EXPECT_EQ(finished.times, 1);
}

TEST_F(ServerFunctionTest, AnswersNoResultForAnExceptionThatEscapes)
{
  const LogCapture log;
  for (const bool known : {true, false})
  {
    Make(
        [known](auto&&...) -> IResult
        {
          if (known)
            throw std::runtime_error("broken");
          throw 1;
        },
        postal);
    finished = {};
    Call(R"(["a",true,1,1,1])");
    postal->RunAll();
    EXPECT_EQ(finished.times, 1);
    EXPECT_EQ(finished.result.Code(), 0x80010002U);
  }
}

TEST_F(ServerFunctionTest, FinishesAReplyOnceWhenACancellationRacesTheCall)
{
  Make(EchoCallable(), postal);
  Call(R"(["a",true,1,1,1])");
  function->FinishOutstanding(EResult::ShuttingDown);
  EXPECT_EQ(finished.result, IResult(EResult::ShuttingDown));
  postal->RunAll();
  function->FinishOutstanding(EResult::ShuttingDown);
  EXPECT_EQ(finished.times, 1);
  EXPECT_EQ(calls, 0);

  // The same from two threads: each call is finished by one or the other, never by both.
  std::atomic<int> times = 0;
  std::atomic<bool> done = false;
  constexpr int rounds = 2000;
  std::thread canceller(
      [&]
      {
        while (!done)
          function->FinishOutstanding(EResult::Canceled);
      });
  for (int i = 0; i < rounds; ++i)
  {
    std::string_view text = R"(["a",true,1,1,1])";
    function->Invoke(text, NMX::Caller{}, [&](const NMX::IServerReply&) { ++times; });
    postal->RunAll();
  }
  done = true;
  canceller.join();
  EXPECT_EQ(times, rounds);
}

TEST_F(ServerFunctionTest, KeepsItsServiceAndOutlivesItsOwner)
{
  struct Service
  {
    explicit Service(bool& flag) : gone(flag) {}
    ~Service() { gone = true; }
    bool& gone;
  };
  bool gone = false;
  Make([service = std::make_shared<Service>(gone)](auto&&...) -> IResult { return EResult::Ok; }, postal);
  Call(R"(["a",true,1,1,1])");
  function.reset(); // the server has dropped it with a call outstanding
  EXPECT_FALSE(gone);
  postal->RunAll();
  EXPECT_EQ(finished.result, IResult(EResult::Ok));
  EXPECT_TRUE(gone);
}

TEST(ServerFunction, AnswersTheTruthOfAQueryBesideItsOutputs)
{
  constexpr ArgumentText reason[] = {{"Reason", ""}};
  const auto query = NMX::MakeShared<VServerFunction<bool(std::string&)>>(
      FunctionRecord{"Group.CanDoIt", "", reason, ""},
      [](std::string& text)
      {
        text = "because";
        return false;
      },
      nullptr);
  std::string_view text = "[]";
  std::optional<bool> returned;
  query->Invoke(text, NMX::Caller{},
                [&](const NMX::IServerReply& reply)
                {
                  EXPECT_EQ(reply.Result(), IResult(EResult::Ok));
                  returned = reply.Returned();
                });
  EXPECT_EQ(returned, std::optional(false));
  EXPECT_TRUE(query->ReturnsTruth());
}
