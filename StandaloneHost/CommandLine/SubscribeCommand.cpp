#include "StandaloneHost/CommandLine/Answers.h"
#include "StandaloneHost/CommandLine/Client.h"
#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Description.h"
#include "StandaloneHost/CommandLine/Invocation.h"
#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/CommandLine/Names.h"
#include "StandaloneHost/CommandLine/Output.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <ctime>
#include <limits>
#include <optional>

namespace CommandLine
{

namespace
{

constexpr auto firstPause = std::chrono::milliseconds(250);
constexpr auto longestPause = std::chrono::milliseconds(8000);

/// The time of the day for people, or date and time in UTC.
std::string TimeText(bool utc)
{
  const auto now = std::chrono::system_clock::now().time_since_epoch();
  const auto milliseconds = std::chrono::duration_cast<std::chrono::milliseconds>(now).count();
  const auto seconds = static_cast<std::time_t>(milliseconds / 1000);
  std::tm parts{};
  if (utc)
    gmtime_r(&seconds, &parts);
  else
    localtime_r(&seconds, &parts);
  char text[64];
  std::strftime(text, sizeof text, utc ? "%Y-%m-%dT%H:%M:%S" : "%H:%M:%S", &parts);
  char fraction[16];
  std::snprintf(fraction, sizeof fraction, ".%03d%s", static_cast<int>(milliseconds % 1000), utc ? "Z" : "");
  return std::string(text) + fraction;
}

/// How many notifications are wanted; 0 is without end.
std::uint64_t CountOf(const Invocation& invocation)
{
  if (invocation.Has("once") && invocation.Has("count"))
    throw UsageError("--once and --count do not go together");
  if (invocation.Has("once"))
    return 1;
  if (!invocation.Has("count"))
    return std::numeric_limits<std::uint64_t>::max();
  const auto count = NumberOf(invocation.Value("count"));
  if (!count || *count == 0)
    throw UsageError("--count: expected a whole number above 0, got " + Quoted(invocation.Value("count")));
  return *count;
}

std::vector<std::string> NamesToHear(const Description& description)
{
  std::vector<std::string> names;
  for (const Function& callback : description.callbacks)
  {
    names.push_back(callback.name);
    if (const std::string all = callback.group + ".*"; std::find(names.begin(), names.end(), all) == names.end())
      names.push_back(all);
  }
  return names;
}

class Subscription
{
public:
  explicit Subscription(const Invocation& invocation)
      : m_invocation(invocation), m_target(invocation.Host()), m_json(invocation.Has("json")),
        m_left(CountOf(invocation))
  {
    m_loop.HearSignals();
    m_loop.WatchOutput();
  }

  /// Prints until as many have come as are wanted. Throws Ended, or CommandError when there is no host from the start
  /// or one that does not let it in.
  void Run()
  {
    auto pause = firstPause;
    for (;;)
      try
      {
        Client client(m_target, m_loop);
        Open(client);
        pause = firstPause;
        Hear(client);
        return;
      }
      catch (const HostError& failure)
      {
        if (m_epoch.empty() || failure.Lasting())
          throw;
        // Told once for each loss, not for each attempt.
        if (m_connected)
          Tell(std::string(failure.what()) + "; trying to connect again");
        m_connected = false;
        m_loop.Sleep(pause);
        pause = std::min(pause * 2, longestPause);
      }
  }

private:
  void Open(Client& client)
  {
    m_description = FetchDescription(client);
    const std::vector<std::string> names = NamesToHear(m_description);
    for (const std::string& word : m_invocation.words)
    {
      const std::string name = ResolveName(word, names, "callback");
      const Answer answer = client.Call("Server.Subscribe", '[' + JsonString(name) + ']');
      if (answer.failed)
        throw CommandError(EStatus::Failed, Visible(name) + ": " + ErrorText(answer.json));
    }
    if (!m_epoch.empty())
      Tell(m_epoch == client.Epoch()
               ? "connected again; changes meanwhile were not told of"
               : "connected again; the host was started anew, and all that is remembered of it may be stale");
    else if (!m_json)
      Tell("listening");
    m_epoch = client.Epoch();
    m_connected = true;
  }

  void Hear(Client& client)
  {
    while (m_left > 0)
      if (const auto notification = client.Next(std::chrono::hours(1)))
      {
        Show(*notification);
        --m_left;
      }
  }

  void Show(const Notification& notification) const
  {
    if (m_json)
      return Print(R"({"time":")" + TimeText(true) + R"(","epoch":)" + JsonString(m_epoch) + R"(,"name":)" +
                   JsonString(notification.name) + R"(,"params":)" + notification.params + "}\n");
    std::string line = TimeText(false) + "  " + Visible(notification.name);
    if (const std::string arguments = NotificationText(notification, m_description); !arguments.empty())
      line += "  " + arguments;
    Print(line + '\n');
  }

  const Invocation& m_invocation;
  const Target m_target;
  const bool m_json;
  Loop m_loop;
  std::uint64_t m_left;
  Description m_description;
  std::string m_epoch; ///< empty until it was connected once
  bool m_connected = false;
};

}

int RunSubscribe(const Invocation& invocation)
{
  if (invocation.words.empty())
    throw UsageError("subscribe: to which callbacks? describe lists them, and GROUP.* is all of a group");
  Subscription(invocation).Run();
  return static_cast<int>(EStatus::Success);
}

}
