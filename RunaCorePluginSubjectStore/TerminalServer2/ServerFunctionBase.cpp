#include "RunaCorePluginSubjectStore/TerminalServer2/ServerFunctionBase.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <exception>
#include <utility>
#include <vector>

namespace TerminalServer2
{

using NMX::EResult;
using NMX::IResult;

ServerFunctionBase::ServerFunctionBase(const FunctionRecord& record, std::shared_ptr<NMX::IPostalService> postal)
    : m_record(record), m_postal(std::move(postal))
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
  if (!m_postal)
  {
    RunAndFinish(*reply);
    return;
  }
  try
  {
    // The reply is in the set before its task can run, because the task needs the same mutex.
    const std::lock_guard lock(m_mutex);
    const auto place = m_outstanding.insert(reply).first;
    try
    {
      m_postal->Post([self = SharedSelf(*this), reply] { self->RunPosted(reply); });
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

bool ServerFunctionBase::Take(const std::shared_ptr<VPendingReply>& reply)
{
  const std::lock_guard lock(m_mutex);
  return m_outstanding.erase(reply) == 1;
}

void ServerFunctionBase::RunPosted(const std::shared_ptr<VPendingReply>& reply)
{
  if (Take(reply))
    RunAndFinish(*reply);
}

void ServerFunctionBase::RunAndFinish(VPendingReply& reply)
{
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
  reply.Finish();
}

void ServerFunctionBase::FinishOutstanding(IResult result)
{
  std::unordered_set<std::shared_ptr<VPendingReply>> taken;
  {
    const std::lock_guard lock(m_mutex);
    taken.swap(m_outstanding);
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
