#include "StandaloneHost/Simulation/Devices.h"
#include "StandaloneHost/Simulation/VHostFunction.h"
#include "tests/Support/LogCapture.h"
#include "tests/Support/ManualPostal.h"
#include "tests/Support/StoreFixture.h"

#include <map>
#include <stdexcept>
#include <thread>

using NMX::EResult;
using NMX::IResult;
using namespace TerminalServer2;
using namespace std::string_literals;

namespace
{

using Values = Simulation::ArgumentValues;

/// A function with an input of each type, one of them after an output.
class HostFunctionTest : public testing::Test
{
protected:
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

  /// Calls and returns what was left of the text.
  std::string Call(std::string_view text)
  {
    times = 0;
    function->Invoke(text, NMX::Caller{},
                     [this](const NMX::IServerReply& reply)
                     {
                       ++times;
                       result = reply.Result();
                       complaint = reply.Text();
                     });
    return std::string(text);
  }

  void SetUp() override
  {
    Make([this](const Values& inputs, Values&) { return taken.push_back(inputs), EResult::Ok; }, postal);
  }

  std::shared_ptr<ManualPostal> postal = std::make_shared<ManualPostal>();
  std::shared_ptr<Simulation::VHostFunction> function;
  std::vector<Values> taken;  // what the operation was called with
  std::atomic<int> times = 0; // that the latest call was finished
  IResult result;
  std::string complaint;
};

constexpr std::string_view sound = R"(["a",true,1])";

TEST_F(HostFunctionTest, ReadsItsInputsAndRunsOnItsPostalService)
{
  for (const auto& [arguments, inputs] :
       std::map<std::string, Values>{{R"( [ "caf\u00e9\n" ,true , 4294967295 ])", {"caf\xC3\xA9\n", true, 4294967295U}},
                                     {R"(["",false,70e-1])", {"", false, 7U}},
                                     {R"(["",false,-0.0])", {"", false, 0U}},
                                     {R"(["",false,429496729500e-2])", {"", false, 4294967295U}}})
  {
    EXPECT_EQ(Call(arguments + " ,\"id\":1}"), " ,\"id\":1}");
    EXPECT_EQ(times, 0) << arguments;
    postal->RunAll();
    EXPECT_EQ(times, 1) << arguments;
    EXPECT_EQ(result, IResult(EResult::Ok)) << arguments;
    EXPECT_TRUE(taken.back() == inputs) << arguments;
  }
}

TEST_F(HostFunctionTest, RefusesWhatDoesNotFitAtOnce)
{
  const std::string array = "expected an array of arguments";
  const std::string first = "argument 1 \"Name\": expected a text";
  const std::string second = "argument 2 \"Flag\": expected true or false";
  const std::string third = "argument 3 \"Count\": expected a whole number from 0 to 4294967295";
  const std::string end = "after 3 arguments: expected no further argument";
  const std::tuple<std::string, EResult, std::string> cases[] = {
      {"", EResult::EndOfData, array},
      {"{}", EResult::InvalidFormat, array},
      {"[", EResult::EndOfData, first},
      {"[null", EResult::InvalidFormat, first},
      {"[\"open", EResult::EndOfData, first},
      {"[\"not \xFF UTF-8\"", EResult::InvalidFormat, first},
      {std::string(100000, '['), EResult::InvalidFormat, first},
      {"[\"a\",0", EResult::InvalidFormat, second},
      {"[\"a\" true", EResult::InvalidFormat, second},
      {"[\"a\",true,\"1\"", EResult::InvalidFormat, third},
      {"[\"a\",true,1.5", EResult::InvalidValue, third},
      {"[\"a\",true,4294967296", EResult::InvalidValue, third},
      {"[\"a\",true,4294967294.99999999999", EResult::InvalidValue, third},
      {"[\"a\",true,1e-400", EResult::InvalidValue, third},
      {"[\"a\",true,18446744073709551616", EResult::InvalidValue, third},
      {"[\"a\",true,1e99999999999", EResult::InvalidValue, third},
      {"[\"a\",true,1", EResult::EndOfData, end},
  };
  for (const auto& [text, expected, told] : cases)
  {
    Call(text);
    EXPECT_EQ(times, 1) << text.substr(0, 60);
    EXPECT_EQ(result, IResult(expected)) << text.substr(0, 60);
    EXPECT_EQ(complaint, told) << text.substr(0, 60);
  }
  EXPECT_EQ(postal->RunAll(), 0);
}

TEST_F(HostFunctionTest, AnswersNoResultForAnExceptionOfTheOperationOrOfPosting)
{
  struct BrokenPostal : NMX::IPostalService
  {
    void Post(std::function<void()>) override { throw std::runtime_error("full"); }
  };
  const LogCapture log;
  const std::pair<Simulation::VHostFunction::Operation, std::shared_ptr<NMX::IPostalService>> broken[] = {
      {[](const Values&, Values&) -> IResult { throw std::runtime_error("broken"); }, postal},
      {[](const Values&, Values&) -> IResult { throw 1; }, postal},
      {nullptr, std::make_shared<BrokenPostal>()}};
  for (const auto& [operation, service] : broken)
  {
    Make(operation, service);
    Call(sound);
    postal->RunAll();
    function->FinishOutstanding(EResult::ShuttingDown);
    EXPECT_EQ(times, 1);
    EXPECT_EQ(result, IResult(EResult::NoResult));
  }
  EXPECT_EQ(log.messages.size(), 3U);
}

TEST_F(HostFunctionTest, FinishesACallOnceWhenACancellationRacesIt)
{
  Call(sound);
  function->FinishOutstanding(EResult::ShuttingDown);
  EXPECT_EQ(result, IResult(EResult::ShuttingDown));
  postal->RunAll();
  EXPECT_EQ(times, 1);
  EXPECT_TRUE(taken.empty());

  constexpr int rounds = 2000;
  std::atomic<bool> done = false;
  std::thread canceller(
      [&]
      {
        while (!done)
          function->FinishOutstanding(EResult::Canceled);
      });
  times = 0;
  for (int i = 0; i < rounds; ++i)
  {
    std::string_view text = sound;
    function->Invoke(text, NMX::Caller{}, [this](const NMX::IServerReply&) { ++times; });
    postal->RunAll();
  }
  done = true;
  canceller.join();
  function->FinishOutstanding(EResult::Canceled);
  EXPECT_EQ(times, rounds);
}

class DevicesTest : public StoreFixture
{
protected:
  Simulation::Devices devices{store};
};

TEST_F(DevicesTest, EachEditIsOneCommitAndARemovedDeviceIsGone)
{
  const std::function<IResult()> edits[] = {[&] { return devices.Add("one", "T"); },
                                            [&] { return devices.Add("one more", "T"); },
                                            [&] { return devices.SetConnected("one", false); },
                                            [&] { return devices.SetCharging("one", true); },
                                            [&] { return devices.SetBattery("one", 0); },
                                            [&] { return devices.SetBattery("one", 100); },
                                            [&] { return devices.SetRadio("one", 7); },
                                            [&] { return devices.Remove("one"); }};
  int commits = 0;
  for (const auto& edit : edits)
  {
    EXPECT_EQ(edit(), IResult(EResult::Ok)) << commits;
    EXPECT_EQ(archive.commits, ++commits);
  }
  EXPECT_EQ(devices.Urns(), std::set<std::string>{"one more"});
  EXPECT_TRUE(store->Reader()->ApplicationEntries(NMX::EntryPath("Application/Devices/one")).empty());
  EXPECT_TRUE(NMX::EntryPath::Known("Application/Devices/one more/Type"));
  for (const char* entry : {"Type", "Connected", "Charging", "Battery", "Radio"})
    EXPECT_FALSE(NMX::EntryPath::Known("Application/Devices/one/"s + entry)) << "its memory is given back: " << entry;
}

TEST_F(DevicesTest, RefusesAndChangesNothing)
{
  const std::string longest(255, 'x');
  ASSERT_EQ(devices.Add(longest, "T"), IResult(EResult::Ok));
  const auto expectOnlyFailures = [&](const std::string& urn, EResult expected)
  {
    for (const IResult result : {devices.Remove(urn), devices.SetConnected(urn, false), devices.SetCharging(urn, true),
                                 devices.SetBattery(urn, 1), devices.SetRadio(urn, 1)})
      EXPECT_EQ(result, IResult(expected)) << urn;
  };
  for (const std::string& urn : {std::string(), "two/three"s, "two\0"s, "two\x1F"s, "two\x7F"s, longest + 'x'})
    EXPECT_EQ(devices.Add(urn, "T"), IResult(EResult::InvalidArgument)) << urn;
  EXPECT_EQ(devices.Add("two", ""), IResult(EResult::InvalidArgument));
  EXPECT_EQ(devices.Add("two", std::string(1025, 't')), IResult(EResult::InvalidValue));
  EXPECT_EQ(devices.SetBattery(longest, 101), IResult(EResult::InvalidValue));
  expectOnlyFailures("", EResult::NotFound);
  expectOnlyFailures("two", EResult::NotFound);
  archive.full = true;
  expectOnlyFailures(longest, EResult::DiskFull);
  EXPECT_EQ(devices.Add("four", "T"), IResult(EResult::DiskFull));

  EXPECT_EQ(devices.Urns(), std::set{longest});
  Simulation::DeviceState state;
  EXPECT_EQ(devices.State(longest, state), IResult(EResult::Ok));
  EXPECT_TRUE(state.connected && !state.charging && state.battery == 100 && state.radio == 0);
  // What a client may choose freely has not become a path.
  EXPECT_EQ(devices.State("two", state), IResult(EResult::NotFound));
  for (const char* path : {"Type", "Connected", "Charging", "Battery", "Radio", "three/Type"})
    EXPECT_FALSE(NMX::EntryPath::Known(std::string("Application/Devices/two/") + path)) << path;
  EXPECT_FALSE(NMX::EntryPath::Known("Application/Devices/two"));
}

}
