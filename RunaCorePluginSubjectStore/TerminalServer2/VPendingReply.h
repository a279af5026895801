#pragma once

#include "HostInterface/NMX/Caller.h"
#include "HostInterface/NMX/FileWork.h"
#include "HostInterface/NMX/IServerFunction.h"

#include <cstddef>
#include <string>

namespace TerminalServer2
{

/// Carries one call's answer back to the server: the completion function, who called, and what the call has come to so
/// far.
/// Whoever finishes it must hold it alone: see ServerFunctionBase.
class VPendingReply : public NMX::IServerReply
{
public:
  VPendingReply(const NMX::Caller& caller, NMX::IServerFunction::Completion completion)
      : m_caller(caller), m_completion(std::move(completion))
  {
  }
  VPendingReply(const VPendingReply&) = delete;
  VPendingReply& operator=(const VPendingReply&) = delete;
  virtual ~VPendingReply() = default;

  [[nodiscard]] NMX::IResult Result() const override { return m_result; }
  [[nodiscard]] std::string_view Text() const override { return m_text; }

  [[nodiscard]] const NMX::Caller& MadeBy() const { return m_caller; }

  /// How long the text of the arguments was, which is about what they take.
  [[nodiscard]] std::size_t ArgumentBytes() const { return m_argumentBytes; }
  void SetArgumentBytes(std::size_t bytes) { m_argumentBytes = bytes; }

  /// What the call asks of files. [strand]
  [[nodiscard]] NMX::FileWork& Files() { return m_files; }

  /// Runs the call and keeps its result, once more after it has waited for a file. Throws what the service throws.
  virtual void Run() = 0;

  /// Hands the reply to the completion function.
  void Finish();

  void SetResult(NMX::IResult result, std::string text = {});

private:
  const NMX::Caller m_caller;
  NMX::IServerFunction::Completion m_completion;
  NMX::FileWork m_files;
  std::size_t m_argumentBytes = 0;
  NMX::IResult m_result = NMX::EResult::NoResult;
  std::string m_text;
};

}
