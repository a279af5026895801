// One call of a function with one text argument, from the request text to the reply: through the binding, and written
// by hand for this one function.

#include "HostInterface/NotificationSystem/VAsioPostalServiceStrand.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VServerFunction.h"

#include <benchmark/benchmark.h>
#include <boost/asio/io_context.hpp>
#include <boost/json/monotonic_resource.hpp>
#include <boost/json/stream_parser.hpp>
#include <boost/unordered/unordered_flat_map.hpp>

#include <string>

namespace
{

using Table = boost::unordered_flat_map<std::string, std::string>;

Table MakeTable()
{
  Table table;
  for (int i = 0; i < 1000; ++i)
    table.emplace("Subject " + std::to_string(i), "#ff" + std::to_string(100000 + i));
  return table;
}

constexpr std::string_view request = R"(["Subject 567"])";

std::string Reply(const std::string& colour)
{
  std::string reply;
  reply.reserve(128);
  reply += R"({"jsonrpc":"2.0","id":1,"result":{"code":0,"name":"Ok","outputs":{"ColorHtml":")";
  reply += colour;
  reply += "\"}}}";
  return reply;
}

void HandWritten(benchmark::State& state)
{
  const Table table = MakeTable();
  boost::json::stream_parser parser;
  for (auto _ : state)
  {
    unsigned char buffer[2048];
    boost::json::monotonic_resource memory(buffer, sizeof buffer);
    parser.reset(&memory);
    parser.write(request.data(), request.size());
    parser.finish();
    const boost::json::value arguments = parser.release();
    const auto& name = arguments.get_array()[0].get_string();
    const auto found = table.find(std::string(name.data(), name.size()));
    std::string reply = Reply(found->second);
    benchmark::DoNotOptimize(reply);
  }
}

struct Postal : NMX::IAsioPostalService
{
  void Post(std::function<void()>) override {}
  boost::asio::io_context& Context() override { return context; }
  boost::asio::io_context context{1};
};

/// Takes the one output of the call.
struct TextWriter final : TerminalServer2::IValueWriter
{
  void Bool(bool) override {}
  void UInt32(std::uint32_t) override {}
  void UInt64(std::uint64_t) override {}
  void Double(double) override {}
  void Text(std::string_view value) override { text = value; }
  void TextSet(const std::set<std::string>&) override {}
  void TextList(const std::vector<std::string>&) override {}
  void WarningMap(std::span<const Warning>) override {}
  std::string text;
};

void ThroughTheBinding(benchmark::State& state)
{
  using Signature = NMX::IResult(const std::string&, std::string&);
  static constexpr TerminalServer2::ArgumentText texts[] = {{"Name", ""}, {"ColorHtml", ""}};
  const Table table = MakeTable();
  const auto postal = std::make_shared<Postal>();
  const auto function = NMX::MakeShared<TerminalServer2::VServerFunction<Signature>>(
      TerminalServer2::FunctionRecord{"Group.Color", "", texts, ""},
      [&](const std::string& name, std::string& colour) -> NMX::IResult
      {
        colour = table.find(name)->second;
        return NMX::EResult::Ok;
      },
      std::make_shared<TerminalServer2::CallQueue>(
          NMX::MakeShared<NotificationSystem::VAsioPostalServiceStrand>(postal)));
  std::string reply;
  for (auto _ : state)
  {
    std::string_view text = request;
    function->Invoke(text, NMX::Caller{},
                     [&](const NMX::IServerReply& finished)
                     {
                       TextWriter writer;
                       finished.WriteOutputs(writer);
                       reply = Reply(writer.text);
                     });
    postal->context.restart();
    postal->context.poll();
    benchmark::DoNotOptimize(reply);
  }
}

}

BENCHMARK(HandWritten);
BENCHMARK(ThroughTheBinding);
