#include "RunaCorePluginSubjectStore/TerminalServer2/VPendingReply.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <utility>

namespace TerminalServer2
{

void VPendingReply::SetResult(NMX::IResult result, std::string text)
{
  m_result = result;
  m_text = std::move(text);
}

void VPendingReply::Finish()
{
  const auto completion = std::exchange(m_completion, nullptr);
  if (!completion)
    return;
  try
  {
    completion(*this);
  }
  catch (...)
  {
    NMX::Log(NMX::serverLog, NMX::ESeverity::Error, "The server failed to take a reply.");
  }
}

}
