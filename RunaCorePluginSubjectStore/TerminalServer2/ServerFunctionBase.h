#pragma once

#include "HostInterface/NMX/IPostalService.h"
#include "HostInterface/NMX/IServerFunction.h"
#include "HostInterface/NMX/VShared.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/ArgumentReader.h"
#include "RunaCorePluginSubjectStore/TerminalServer2/VPendingReply.h"

#include <memory>
#include <mutex>
#include <string>
#include <unordered_set>

namespace TerminalServer2
{

/// What all server functions have in common: the record, the postal service on which calls run, and the replies that
/// are outstanding. A reply belongs to whoever takes it out of the outstanding set, and only that one finishes it.
class ServerFunctionBase : public NMX::IServerFunction, public NMX::VShared
{
public:
  [[nodiscard]] const FunctionRecord& Record() const final { return m_record; }
  void FinishOutstanding(NMX::IResult result) final;

protected:
  /// Without a postal service, calls run inside Invoke.
  ServerFunctionBase(const FunctionRecord& record, std::shared_ptr<NMX::IPostalService> postal);

  /// Finishes the reply at once when its arguments could not be read; otherwise runs the call where it belongs.
  void Accept(const std::shared_ptr<VPendingReply>& reply, NMX::IResult parsed, const ArgumentReader& reader,
              std::size_t argumentsRead);

private:
  void RunPosted(const std::shared_ptr<VPendingReply>& reply);
  bool Take(const std::shared_ptr<VPendingReply>& reply);
  void RunAndFinish(VPendingReply& reply);
  [[nodiscard]] std::string Complaint(const ArgumentReader& reader, std::size_t argumentsRead) const;

  const FunctionRecord m_record;
  const std::shared_ptr<NMX::IPostalService> m_postal;
  std::mutex m_mutex;
  std::unordered_set<std::shared_ptr<VPendingReply>> m_outstanding; // guarded by m_mutex
};

}
