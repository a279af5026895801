#include "StandaloneHost/CommandLine/Answers.h"
#include "StandaloneHost/CommandLine/Arguments.h"
#include "StandaloneHost/CommandLine/Client.h"
#include "StandaloneHost/CommandLine/CommandError.h"
#include "StandaloneHost/CommandLine/Description.h"
#include "StandaloneHost/CommandLine/Invocation.h"
#include "StandaloneHost/CommandLine/Layout.h"
#include "StandaloneHost/CommandLine/LongWork.h"
#include "StandaloneHost/CommandLine/Names.h"
#include "StandaloneHost/CommandLine/Output.h"
#include "StandaloneHost/CommandLine/ProgressDisplay.h"

#include <algorithm>
#include <span>
#include <unistd.h>

namespace CommandLine
{

namespace
{

/// How long a notification is waited for until the host is asked all the same.
constexpr auto lookAfter = std::chrono::milliseconds(500);

const Function& FindCalled(const Description& description, std::string_view given)
{
  std::vector<std::string> names;
  for (const Function& function : description.functions)
    names.push_back(function.name);
  return *description.FindFunction(ResolveName(given, names, "function"));
}

std::string ParamsOf(std::span<const std::string> inputs)
{
  std::string params;
  for (const std::string& input : inputs)
    params += (params.empty() ? "" : ",") + input;
  return '[' + params + ']';
}

std::string Failure(const Function& function, const Answer& answer)
{
  const std::string text = ErrorText(answer.json);
  const bool closed = function.preview && text.starts_with("NotPermitted");
  return closed ? text + ": it is a preview, which a host opens with --level 1" : text;
}

void Subscribe(Client& client, const std::string& callback)
{
  const Answer answer = client.Call("Server.Subscribe", '[' + JsonString(callback) + ']');
  if (answer.failed)
    throw CommandError(EStatus::Failed, callback + ": " + ErrorText(answer.json));
}

/// Follows the work until it ends; answers the exit status.
EStatus Follow(ILongWork& work, Client& client, Loop::Clock::time_point deadline)
{
  ProgressDisplay display;
  for (;;)
  {
    const Step step = work.Look(client);
    display.Show(step.text, step.count);
    if (step.state != Step::EState::GoesOn)
      return step.state == Step::EState::EndedWell ? EStatus::Success : EStatus::Failed;
    const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(deadline - Loop::Clock::now());
    if (left <= std::chrono::milliseconds(0))
      throw CommandError(EStatus::Failed, "the work has not ended within --wait-time and goes on");
    if (auto notification = client.Next(std::min<std::chrono::milliseconds>(lookAfter, left)))
      do
        work.Hear(*notification);
      while ((notification = client.Next(std::chrono::milliseconds(0))));
  }
}

/// A call on its way: what it has come to is what is told when a signal ends it.
class Calling
{
public:
  explicit Calling(const Invocation& invocation) : m_invocation(invocation), m_json(invocation.Has("json")) {}

  /// Answers the exit status.
  int Run()
  {
    constexpr int signalled = 128;
    try
    {
      return static_cast<int>(Call());
    }
    catch (const Ended&)
    {
      if (m_loop.Signal() == 0)
        throw;
      if (!m_stage.empty())
        Tell(m_stage);
      return signalled + m_loop.Signal();
    }
  }

private:
  EStatus Call()
  {
    Client client(m_invocation.Host(), m_loop);
    const Description description = FetchDescription(client);
    const Function& function = FindCalled(description, m_invocation.words.front());
    const auto inputs = ReadInputs(function, std::span(m_invocation.words).subspan(1), description);

    const auto work = WorkBegunBy(function.name, inputs);
    const bool wait = work != nullptr && m_invocation.Has("wait");
    if (wait)
    {
      // Without it, a signal ends the process.
      m_loop.HearSignals();
      Subscribe(client, work->Callback());
    }
    m_stage = "no longer waiting for an answer; the call may be carried out all the same";
    const Answer answer = client.Call(function.name, ParamsOf(inputs));
    if (!Show(answer, function, description))
      return EStatus::Failed;
    if (!wait)
    {
      if (work != nullptr && !m_json)
        Tell(work->Hint());
      return EStatus::Success;
    }
    m_stage = "no longer waiting; the work goes on";
    work->Begin(answer.json);
    return Follow(*work, client, Deadline());
  }

  /// Answers whether the call succeeded.
  [[nodiscard]] bool Show(const Answer& answer, const Function& function, const Description& description) const
  {
    const std::size_t width = TerminalWidth(STDOUT_FILENO);
    if (m_json)
      Print(answer.json + '\n');
    else if (answer.failed)
      Tell(Failure(function, answer));
    else if (const std::string text = ResultText(&function, answer.json, description, width); !text.empty())
      Print(text);
    else if (width != 0)
      Tell("none"); // a program that reads the output would take it for one
    return !answer.failed;
  }

  [[nodiscard]] Loop::Clock::time_point Deadline() const
  {
    return m_invocation.Has("wait-time")
               ? Loop::Clock::now() + ParseSeconds(m_invocation.Value("wait-time"), "wait-time")
               : Loop::Clock::time_point::max();
  }

  const Invocation& m_invocation;
  const bool m_json;
  Loop m_loop;
  std::string m_stage; ///< what a signal leaves behind
};

}

int RunCall(const Invocation& invocation)
{
  if (invocation.words.empty())
    throw UsageError("call: which function? describe lists them");
  if (invocation.Has("wait-time") && !invocation.Has("wait"))
    throw UsageError("--wait-time: goes with --wait");
  if (invocation.Has("wait-time"))
    (void)ParseSeconds(invocation.Value("wait-time"), "wait-time");
  return Calling(invocation).Run();
}

}
