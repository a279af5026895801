#pragma once

#include "HostInterface/NMX/IServerFunction.h"
#include "HostInterface/NMX/VShared.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/ArgumentReader.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/CallQueue.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VPendingReply.h"

#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <unordered_set>

namespace TerminalServer2
{

/// What all server functions have in common: the record, the queue in which the group's calls run, and the replies that
/// are outstanding. A reply belongs to whoever takes it out of the outstanding set, and only that one finishes it, or
/// puts it back because its call waits for a file.
class ServerFunctionBase : public NMX::IServerFunction, public NMX::VShared
{
public:
  [[nodiscard]] const FunctionRecord& Record() const final { return m_record; }
  void FinishOutstanding(NMX::IResult result) final;

protected:
  /// Without a queue, calls run inside Invoke.
  ServerFunctionBase(const FunctionRecord& record, std::shared_ptr<CallQueue> calls);

  /// Finishes the reply at once when its arguments could not be read; otherwise runs the call where it belongs.
  void Accept(const std::shared_ptr<VPendingReply>& reply, NMX::IResult parsed, const ArgumentReader& reader,
              std::size_t argumentsRead);

private:
  using Reply = std::shared_ptr<VPendingReply>;
  using WeakSelf = std::weak_ptr<ServerFunctionBase>;

  void RunPosted(const Reply& reply);
  bool TakeAndRun(const Reply& reply);
  [[nodiscard]] std::optional<std::uint64_t> Take(const Reply& reply);
  void Run(VPendingReply& reply, NMX::FileWork* files);
  bool WaitForFile(const Reply& reply, std::uint64_t cancellations);
  bool PutBack(const Reply& reply, std::uint64_t cancellations);
  [[nodiscard]] static CallQueue::Turn TurnOf(WeakSelf weakSelf, std::weak_ptr<VPendingReply> weakReply,
                                              std::optional<NMX::EFileEnd> end);
  [[nodiscard]] std::string Complaint(const ArgumentReader& reader, std::size_t argumentsRead) const;

  const FunctionRecord m_record;
  const std::shared_ptr<CallQueue> m_calls;
  std::mutex m_mutex;
  std::unordered_set<Reply> m_outstanding; // guarded by m_mutex, as are the following
  std::uint64_t m_cancellations = 0;
  NMX::IResult m_cancelledWith;
};

}
