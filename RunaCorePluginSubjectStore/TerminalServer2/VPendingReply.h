#pragma once

#include "HostInterface/NMX/IServerFunction.h"

#include <string>

namespace TerminalServer2
{

/// Carries one call's answer back to the server: the completion function, and what the call has come to so far.
/// Whoever finishes it must hold it alone: see ServerFunctionBase.
class VPendingReply : public NMX::IServerReply
{
public:
  explicit VPendingReply(NMX::IServerFunction::Completion completion) : m_completion(std::move(completion)) {}
  VPendingReply(const VPendingReply&) = delete;
  VPendingReply& operator=(const VPendingReply&) = delete;
  virtual ~VPendingReply() = default;

  [[nodiscard]] NMX::IResult Result() const override { return m_result; }
  [[nodiscard]] std::string_view Text() const override { return m_text; }

  /// Runs the call and keeps its result. Throws what the service throws.
  virtual void Run() = 0;

  /// Hands the reply to the completion function.
  void Finish();

  void SetResult(NMX::IResult result, std::string text = {});

private:
  NMX::IServerFunction::Completion m_completion;
  NMX::IResult m_result = NMX::EResult::NoResult;
  std::string m_text;
};

}
