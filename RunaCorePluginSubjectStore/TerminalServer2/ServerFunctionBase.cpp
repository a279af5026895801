#include "RunaCorePluginSubjectStore/TerminalServer2/ServerFunctionBase.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <exception>
#include <utility>
#include <vector>

namespace TerminalServer2
{

using NMX::EResult;
using NMX::IResult;

ServerFunctionBase::ServerFunctionBase(const FunctionRecord& record, std::shared_ptr<CallQueue> calls)
    : m_record(record), m_calls(std::move(calls))
{
}

void ServerFunctionBase::Accept(const std::shared_ptr<VPendingReply>& reply, IResult parsed,
                                const ArgumentReader& reader, std::size_t argumentsRead)
{
  if (parsed.Failed())
  {
    reply->SetResult(parsed, Complaint(reader, argumentsRead));
    reply->Finish();
    return;
  }
  if (!m_calls)
  {
    Run(*reply, nullptr);
    reply->Finish();
    return;
  }
  try
  {
    // The reply is in the set before its task can run, because the task needs the same mutex.
    const std::lock_guard lock(m_mutex);
    const auto place = m_outstanding.insert(reply).first;
    try
    {
      m_calls->Post([self = SharedSelf(*this), reply] { self->RunPosted(reply); });
      return;
    }
    catch (...)
    {
      m_outstanding.erase(place);
      throw;
    }
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "%1%: the call could not be posted: %2%", m_record.name,
             failure.what());
  }
  reply->Finish();
}

/// How often calls had been cancelled by then; nothing when the reply belongs to somebody else.
std::optional<std::uint64_t> ServerFunctionBase::Take(const Reply& reply)
{
  const std::lock_guard lock(m_mutex);
  return m_outstanding.erase(reply) == 1 ? std::optional(m_cancellations) : std::nullopt;
}

void ServerFunctionBase::RunPosted(const Reply& reply)
{
  const NMX::Caller caller = reply->MadeBy();
  if (!m_calls->Holds(caller))
  {
    if (TakeAndRun(reply))
      m_calls->Hold(caller);
    return;
  }
  if (m_calls->Queue(caller, reply->ArgumentBytes(), TurnOf(SharedSelf(*this), reply, std::nullopt)) || !Take(reply))
    return;
  reply->SetResult(EResult::WouldBlock, "too much waits behind a call that waits for a file");
  reply->Finish();
}

/// A run of a call when its turn comes: the first one, or the one after a look at a file that ended like that. It keeps
/// nothing alive: the reply lives in the outstanding set, or has been finished.
CallQueue::Turn ServerFunctionBase::TurnOf(WeakSelf weakSelf, std::weak_ptr<VPendingReply> weakReply,
                                           std::optional<NMX::EFileEnd> end)
{
  return [weakSelf = std::move(weakSelf), weakReply = std::move(weakReply), end]
  {
    const auto self = weakSelf.lock();
    const auto reply = weakReply.lock();
    if (!self || !reply)
      return false;
    if (end)
      reply->Files().End(*end, self->m_record.name, self->m_calls->Files().Patience());
    return self->TakeAndRun(reply);
  };
}

/// Runs the call, unless somebody else has finished it, and finishes it, unless it now waits for a file: then true.
bool ServerFunctionBase::TakeAndRun(const Reply& reply)
{
  const auto cancellations = Take(reply);
  if (!cancellations)
    return false;
  Run(*reply, &reply->Files());
  if (reply->Files().Waits())
    return WaitForFile(reply, *cancellations);
  reply->Finish();
  return false;
}

void ServerFunctionBase::Run(VPendingReply& reply, NMX::FileWork* files)
{
  const NMX::CallContext context(reply.MadeBy(), files);
  try
  {
    reply.Run();
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "%1%: %2%", m_record.name, failure.what());
    reply.SetResult(EResult::NoResult);
  }
  catch (...)
  {
    NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "%1%: an unknown exception", m_record.name);
    reply.SetResult(EResult::NoResult);
  }
}

/// Puts the reply back and has the file looked at that the call asks for; the call runs again afterwards. Finishes the
/// reply when that cannot be: then false.
bool ServerFunctionBase::WaitForFile(const Reply& reply, std::uint64_t cancellations)
{
  bool mine = true;
  reply->SetResult(EResult::NoResult);
  try
  {
    mine = !PutBack(reply, cancellations);
    if (!mine)
    {
      reply->Files().Begin(m_calls->Files(),
                           [queue = std::weak_ptr(m_calls), self = WeakSelf(SharedSelf(*this)),
                            weakReply = std::weak_ptr(reply), caller = reply->MadeBy()](auto end)
                           {
                             if (const auto calls = queue.lock())
                               calls->PostTurn(caller, TurnOf(self, weakReply, end));
                           });
      return true;
    }
  }
  catch (const std::exception& failure)
  {
    NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "%1%: the call could not wait for a file: %2%", m_record.name,
             failure.what());
    mine = mine || Take(reply);
  }
  if (mine)
    reply->Finish();
  return false;
}

/// False when calls have been cancelled since the reply was taken; it has that result then.
bool ServerFunctionBase::PutBack(const Reply& reply, std::uint64_t cancellations)
{
  const std::lock_guard lock(m_mutex);
  if (m_cancellations == cancellations)
    return m_outstanding.insert(reply).second;
  reply->SetResult(m_cancelledWith);
  return false;
}

void ServerFunctionBase::FinishOutstanding(IResult result)
{
  std::unordered_set<Reply> taken;
  {
    const std::lock_guard lock(m_mutex);
    taken.swap(m_outstanding);
    ++m_cancellations;
    m_cancelledWith = result;
  }
  for (const auto& reply : taken)
  {
    reply->SetResult(result);
    reply->Finish();
  }
}

std::string ServerFunctionBase::Complaint(const ArgumentReader& reader, std::size_t argumentsRead) const
{
  if (!reader.Begun())
    return "expected " + std::string(reader.Expected());
  // The inputs are what the caller sent; outputs only have their place in the record.
  std::size_t input = 0;
  const auto types = Arguments();
  for (std::size_t i = 0; i < m_record.arguments.size(); ++i)
  {
    if (types[i].direction != EDirection::Input)
      continue;
    if (input == argumentsRead)
      return "argument " + std::to_string(input + 1) + " \"" + std::string(m_record.arguments[i].name) +
             "\": expected " + std::string(reader.Expected());
    ++input;
  }
  return "after " + std::to_string(input) + " argument" + (input == 1 ? "" : "s") + ": expected " +
         std::string(reader.Expected());
}

}
