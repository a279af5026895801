#include "StandaloneHost/Simulation/HostSimulation.h"

#include "StandaloneHost/Simulation/VHostFunction.h"
#include "StandaloneHost/Store/IArchive.h"
#include "StandaloneHost/Store/VStore.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"

#include <gmock/gmock.h>

#include <atomic>
#include <map>
#include <stdexcept>
#include <thread>

using NMX::EResult;
using NMX::IResult;
using namespace TerminalServer2;

namespace
{

/// What a call was finished with, and how often. Outputs are written one after the other, each followed by "|".
struct Finished final : IValueWriter
{
  NMX::IServerFunction::Completion Completion()
  {
    return [this](const NMX::IServerReply& reply)
    {
      ++times;
      result = reply.Result();
      text = reply.Text();
      reply.WriteOutputs(*this);
    };
  }

  void Bool(bool value) override { outputs += value ? "true|" : "false|"; }
  void UInt32(std::uint32_t value) override { outputs += std::to_string(value) + '|'; }
  void UInt64(std::uint64_t) override { outputs += "?|"; }
  void Double(double) override { outputs += "?|"; }
  void Text(std::string_view value) override { outputs += std::string(value) + '|'; }
  void TextSet(const std::set<std::string>& value) override
  {
    for (const auto& one : value)
      outputs += one + ',';
    outputs += '|';
  }
  void TextList(const std::vector<std::string>&) override { outputs += "?|"; }
  void WarningMap(std::span<const Warning>) override { outputs += "?|"; }

  int times = 0;
  IResult result;
  std::string text;
  std::string outputs;
};

/// Keeps nothing, with the result that the test chooses.
struct Archive : Store::IArchive
{
  explicit Archive(const IResult& keeping) : result(keeping) {}
  Store::ChangeSet Load() override { return {{}, {}, NMX::TSubjectStoreId(1)}; }
  IResult Keep(const Store::ChangeSet&) override { return result; }
  const IResult& result;
};

class HostSimulationTest : public testing::Test, public IServer
{
protected:
  HostSimulationTest() { Simulation::RegisterGroup(*this, store, postal); }

  IResult RegisterType(Level level, const TypeRecord& record) override
  {
    EXPECT_TRUE(functions.empty());
    EXPECT_EQ(level, 1U);
    EXPECT_EQ(record.name, "HostSimulation");
    return EResult::Ok;
  }
  IResult RegisterCallback(Level, std::shared_ptr<NMX::IServerCallback>) override { return EResult::Failed; }
  IResult RegisterFunction(Level level, std::shared_ptr<NMX::IServerFunction> function) override
  {
    EXPECT_EQ(level, 1U);
    EXPECT_TRUE(functions.emplace(function->Record().name, function).second);
    return EResult::Failed; // which the group does not mind
  }

  Finished Call(const std::string& name, std::string_view arguments)
  {
    Finished finished;
    const auto found = functions.find("HostSimulation." + name);
    if (found == functions.end())
    {
      ADD_FAILURE() << name;
      return finished;
    }
    found->second->Invoke(arguments, finished.Completion());
    postal->RunAll();
    EXPECT_EQ(finished.times, 1) << name;
    return finished;
  }

  IResult keeping;
  std::shared_ptr<Store::VStore> store = NMX::MakeShared<Store::VStore>(std::make_unique<Archive>(keeping));
  std::shared_ptr<ManualPostal> postal = std::make_shared<ManualPostal>();
  std::map<std::string, std::shared_ptr<NMX::IServerFunction>, std::less<>> functions;
};

std::string Quoted(const std::string& text)
{
  return "[\"" + text + "\",\"T\"]";
}

/// A function with an input of each type, which answers them, and an input after an output.
class HostFunctionTest : public testing::Test
{
protected:
  using Values = Simulation::ArgumentValues;

  void Make(Simulation::VHostFunction::Operation operation, std::shared_ptr<NMX::IPostalService> service)
  {
    static constexpr ArgumentText texts[] = {{"Name", ""}, {"Echo", ""}, {"Flag", ""}, {"Count", ""}};
    static constexpr ArgumentType types[] = {{EArgumentType::Text, EDirection::Input},
                                             {EArgumentType::Text, EDirection::Output},
                                             {EArgumentType::Bool, EDirection::Input},
                                             {EArgumentType::UInt32, EDirection::Input}};
    function = NMX::MakeShared<Simulation::VHostFunction>(FunctionRecord{"Group.Function", "", texts, ""}, types,
                                                          std::move(operation), std::move(service));
  }

  void MakeEcho()
  {
    Make(
        [this](const Values& inputs, Values& outputs)
        {
          ++calls;
          outputs[0] = std::get<std::string>(inputs[0]) + '/' + std::to_string(std::get<bool>(inputs[1])) + '/' +
                       std::to_string(std::get<std::uint32_t>(inputs[2]));
          return EResult::Ok;
        },
        postal);
  }

  /// Calls and returns what was left of the text.
  std::string Call(std::string_view text)
  {
    finished = {};
    function->Invoke(text, finished.Completion());
    return std::string(text);
  }

  std::shared_ptr<ManualPostal> postal = std::make_shared<ManualPostal>();
  std::shared_ptr<Simulation::VHostFunction> function;
  Finished finished;
  std::atomic<int> calls = 0;
};

}

TEST_F(HostFunctionTest, ReadsItsInputsAndRunsOnItsPostalService)
{
  MakeEcho();
  for (const auto& [arguments, echo] :
       std::map<std::string, std::string>{{R"( [ "caf\u00e9\n" ,true , 4294967295 ])", "caf\xC3\xA9\n/1/4294967295|"},
                                          {R"(["",false,7.0])", "/0/7|"},
                                          {R"(["",false,70e-1])", "/0/7|"},
                                          {R"(["",false,-0])", "/0/0|"}})
  {
    EXPECT_EQ(Call(arguments + " ,\"id\":1}"), " ,\"id\":1}");
    EXPECT_EQ(finished.times, 0) << arguments;
    postal->RunAll();
    EXPECT_EQ(finished.times, 1) << arguments;
    EXPECT_EQ(finished.result, IResult(EResult::Ok)) << arguments;
    EXPECT_EQ(finished.outputs, echo) << arguments;
  }
}

TEST_F(HostFunctionTest, RefusesWhatDoesNotFitAtOnce)
{
  const std::string first = "argument 1 \"Name\": expected a text";
  const std::string second = "argument 2 \"Flag\": expected true or false";
  const std::string third = "argument 3 \"Count\": expected a whole number from 0 to 4294967295";
  const std::string end = "after 3 arguments: expected no further argument";
  const std::string array = "expected an array of arguments";
  struct Case
  {
    std::string text;
    EResult result;
    std::string complaint;
  };
  const Case cases[] = {
      {"", EResult::EndOfData, array},
      {"{}", EResult::InvalidFormat, array},
      {"[", EResult::EndOfData, first},
      {"[]", EResult::InvalidFormat, first},
      {"[null", EResult::InvalidFormat, first},
      {"[\"open", EResult::EndOfData, first},
      {"[\"not \xFF UTF-8\"", EResult::InvalidFormat, first},
      {std::string(100000, '['), EResult::InvalidFormat, first},
      {"[\"a\"]", EResult::InvalidFormat, second},
      {"[\"a\",0", EResult::InvalidFormat, second},
      {"[\"a\" true", EResult::InvalidFormat, second},
      {"[\"a\",true,\"1\"", EResult::InvalidFormat, third},
      {"[\"a\",true,true", EResult::InvalidFormat, third},
      {"[\"a\",true,-1", EResult::InvalidValue, third},
      {"[\"a\",true,1.5", EResult::InvalidValue, third},
      {"[\"a\",true,4294967296", EResult::InvalidValue, third},
      {"[\"a\",true,18446744073709551616", EResult::InvalidValue, third},
      {"[\"a\",true,1e999", EResult::InvalidValue, third},
      {"[\"a\",true,1e99999999999", EResult::InvalidValue, third},
      {"[\"a\",true,1", EResult::EndOfData, end},
      {"[\"a\",true,1,1]", EResult::InvalidFormat, end},
  };
  MakeEcho();
  for (const Case& c : cases)
  {
    Call(c.text);
    const std::string shown = c.text.substr(0, 60);
    EXPECT_EQ(finished.times, 1) << shown;
    EXPECT_EQ(finished.result, IResult(c.result)) << shown;
    EXPECT_EQ(finished.text, c.complaint) << shown;
    EXPECT_EQ(finished.outputs, "|") << shown;
  }
  postal->RunAll();
  EXPECT_EQ(calls, 0);
}

TEST_F(HostFunctionTest, AnswersNoResultForAnExceptionOfTheOperationOrOfPosting)
{
  struct BrokenPostal : NMX::IPostalService
  {
    void Post(std::function<void()>) override { throw std::runtime_error("full"); }
  };
  const LogCapture log;
  const auto expectNoResult = [&]
  {
    Call(R"(["a",true,1])");
    postal->RunAll();
    function->FinishOutstanding(EResult::ShuttingDown);
    EXPECT_EQ(finished.times, 1);
    EXPECT_EQ(finished.result, IResult(EResult::NoResult));
  };
  Make([](const Values&, Values&) -> IResult { throw std::runtime_error("broken"); }, postal);
  expectNoResult();
  Make([](const Values&, Values&) -> IResult { throw 1; }, postal);
  expectNoResult();
  Make(nullptr, std::make_shared<BrokenPostal>());
  expectNoResult();
  EXPECT_EQ(log.messages.size(), 3U);
}

TEST_F(HostFunctionTest, FinishesACallOnceWhenACancellationRacesIt)
{
  MakeEcho();
  Call(R"(["a",true,1])");
  function->FinishOutstanding(EResult::ShuttingDown);
  EXPECT_EQ(finished.result, IResult(EResult::ShuttingDown));
  postal->RunAll();
  EXPECT_EQ(finished.times, 1);
  EXPECT_EQ(calls, 0);

  constexpr int rounds = 2000;
  std::atomic<int> times = 0;
  std::atomic<bool> done = false;
  std::thread canceller(
      [&]
      {
        while (!done)
          function->FinishOutstanding(EResult::Canceled);
      });
  for (int i = 0; i < rounds; ++i)
  {
    std::string_view text = R"(["a",true,1])";
    function->Invoke(text, [&](const NMX::IServerReply&) { ++times; });
    postal->RunAll();
  }
  done = true;
  canceller.join();
  function->FinishOutstanding(EResult::Canceled);
  EXPECT_EQ(times, rounds);
}

TEST_F(HostSimulationTest, EachEditOfADeviceIsOneCommit)
{
  int commits = 0;
  const auto subscription = store->OnChange("Application/Devices/*", postal, [&] { ++commits; });
  const auto expectState = [&](const char* state)
  {
    const Finished told = Call("DeviceState", R"(["one"])");
    EXPECT_EQ(told.result, IResult(EResult::Ok));
    EXPECT_EQ(told.outputs, state);
  };
  struct Case
  {
    const char* name;
    const char* arguments;
    const char* state;
  };
  const Case cases[] = {{"AddDevice", R"(["one","T"])", "T|true|false|100|0|"},
                        {"SetConnected", R"(["one",false])", "T|false|false|100|0|"},
                        {"SetCharging", R"(["one",true])", "T|false|true|100|0|"},
                        {"SetBattery", R"(["one",0])", "T|false|true|0|0|"},
                        {"SetBattery", R"(["one",100])", "T|false|true|100|0|"},
                        {"SetRadio", R"(["one",4294967295])", "T|false|true|100|4294967295|"}};
  for (const Case& c : cases)
  {
    commits = 0;
    EXPECT_EQ(Call(c.name, c.arguments).result, IResult(EResult::Ok)) << c.name;
    EXPECT_EQ(commits, 1) << c.name;
    expectState(c.state);
  }

  EXPECT_EQ(Call("AddDevice", R"(["one more","T"])").result, IResult(EResult::Ok));
  EXPECT_EQ(Call("Devices", "[]").outputs, "one,one more,|");
  commits = 0;
  EXPECT_EQ(Call("RemoveDevice", R"(["one"])").result, IResult(EResult::Ok));
  EXPECT_EQ(commits, 1);
  EXPECT_EQ(Call("Devices", "[]").outputs, "one more,|");
  EXPECT_EQ(store->Reader()->ApplicationEntries(NMX::EntryPath("Application/Devices/one")).size(), 0U);

  // Gone and back again, it is a new one.
  EXPECT_EQ(Call("AddDevice", R"(["one","U"])").result, IResult(EResult::Ok));
  expectState("U|true|false|100|0|");
}

TEST_F(HostSimulationTest, RefusesAndChangesNothing)
{
  ASSERT_EQ(Call("AddDevice", R"(["one","T"])").result, IResult(EResult::Ok));
  ASSERT_EQ(Call("AddDevice", Quoted(std::string(255, 'x'))).result, IResult(EResult::Ok));
  ASSERT_EQ(Call("RemoveDevice", "[\"" + std::string(255, 'x') + "\"]").result, IResult(EResult::Ok));
  struct Case
  {
    std::string name;
    std::string arguments;
    EResult result;
  };
  const Case cases[] = {{"AddDevice", R"(["one","U"])", EResult::AlreadyPresent},
                        {"AddDevice", Quoted(""), EResult::InvalidArgument},
                        {"AddDevice", R"(["two",""])", EResult::InvalidArgument},
                        {"AddDevice", Quoted("two/three"), EResult::InvalidArgument},
                        {"AddDevice", Quoted("two\\u0000"), EResult::InvalidArgument},
                        {"AddDevice", Quoted("two\\u001f"), EResult::InvalidArgument},
                        {"AddDevice", Quoted("two\\u007f"), EResult::InvalidArgument},
                        {"AddDevice", Quoted(std::string(256, 'x')), EResult::InvalidArgument},
                        {"SetBattery", R"(["one",101])", EResult::InvalidValue},
                        {"DeviceState", R"(["two"])", EResult::NotFound},
                        {"RemoveDevice", R"(["two"])", EResult::NotFound},
                        {"RemoveDevice", R"([""])", EResult::NotFound},
                        {"SetConnected", R"(["two",false])", EResult::NotFound},
                        {"SetCharging", R"(["two",true])", EResult::NotFound},
                        {"SetBattery", R"(["two",1])", EResult::NotFound},
                        {"SetRadio", R"(["two",1])", EResult::NotFound}};
  for (const Case& c : cases)
    EXPECT_EQ(Call(c.name, c.arguments).result, IResult(c.result)) << c.name << c.arguments;
  EXPECT_EQ(Call("Devices", "[]").outputs, "one,|");
  EXPECT_EQ(Call("DeviceState", R"(["one"])").outputs, "T|true|false|100|0|");

  keeping = EResult::DiskFull;
  for (const auto& [name, arguments] : std::map<std::string, std::string>{
           {"AddDevice", R"(["four","T"])"}, {"RemoveDevice", R"(["one"])"}, {"SetConnected", R"(["one",false])"}})
    EXPECT_EQ(Call(name, arguments).result, IResult(EResult::DiskFull)) << name;
  EXPECT_EQ(Call("Devices", "[]").outputs, "one,|");
  EXPECT_EQ(Call("DeviceState", R"(["one"])").outputs, "T|true|false|100|0|");

  // What a client may choose freely has not become a path.
  for (const char* path : {"Application/Devices/two", "Application/Devices/two/Type", "Application/Devices/two/Radio",
                           "Application/Devices/two/Connected", "Application/Devices/two/three/Type"})
    EXPECT_FALSE(NMX::EntryPath::Known(path)) << path;
}
