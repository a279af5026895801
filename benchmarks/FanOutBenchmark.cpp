// One notification to many subscribers: written as text once and put into each one's queue, against writing it as text
// for each.

#include "HostInterface/NotificationSystem/VMultiCallbackPostal.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VServerCallback.h"
#include "StandaloneHost/Server/JsonText.h"
#include "StandaloneHost/Server/Notifier.h"

#include <benchmark/benchmark.h>

#include <deque>
#include <vector>

namespace
{

using namespace Server;

constexpr TerminalServer2::ArgumentText texts[] = {{"Able", ""}};

struct Listener final : IListener
{
  Listener(const Limits& limits, const std::shared_ptr<OutgoingBytes>& waiting) : queue(limits, waiting) {}
  void Notify(const SharedMessage& message, EPolicy policy, const void* callback) override
  {
    (void)queue.Push(message, policy, callback);
    benchmark::DoNotOptimize(SharedMessage(queue.Front()));
    queue.Pop();
  }
  OutgoingQueue queue;
};

struct InlinePostal : NMX::IPostalService
{
  void Post(std::function<void()> task) override { tasks.push_back(std::move(task)); }
  void Run()
  {
    for (auto& task : tasks)
      task();
    tasks.clear();
  }
  std::vector<std::function<void()>> tasks;
};

void OneNotification(benchmark::State& state)
{
  const Limits limits;
  Registry registry;
  const auto postal = std::make_shared<InlinePostal>();
  const auto multiCallback = NMX::MakeShared<NotificationSystem::VMultiCallbackPostal<void(bool)>>();
  using Callback = TerminalServer2::VServerCallback<void(bool), NMX::IMultiCallbackPostal<void(bool)>>;
  (void)registry.Add(
      2, NMX::MakeShared<Callback>(TerminalServer2::FunctionRecord{"Group.AbleChangedCallback", "", texts, ""},
                                   multiCallback, postal));
  Notifier notifier(registry, limits);
  const auto waiting = std::make_shared<OutgoingBytes>(limits);
  std::deque<Listener> listeners;
  for (int i = 0; i < state.range(0); ++i)
    (void)notifier.Subscribe("Group.AbleChangedCallback", listeners.emplace_back(limits, waiting), 2);
  for (auto _ : state)
  {
    multiCallback->Fire(true);
    postal->Run();
  }
  for (Listener& listener : listeners)
    notifier.Forget(listener);
}

void TextForEachOf64(benchmark::State& state)
{
  static constexpr std::string_view names[] = {"Able"};
  std::uint64_t sequence = 0;
  for (auto _ : state)
    for (int i = 0; i < 64; ++i)
    {
      std::string text = "{\"jsonrpc\":\"2.0\",\"method\":";
      AppendString(text, "Group.AbleChangedCallback");
      text += ",\"params\":{";
      MemberWriter writer(text, names);
      writer.Bool(true);
      text += ",\"sequence\":";
      AppendNumber(text, ++sequence);
      text += "}}";
      benchmark::DoNotOptimize(text);
    }
}

}

BENCHMARK(OneNotification)->Arg(1)->Arg(64);
BENCHMARK(TextForEachOf64);
