#pragma once

#include "HostInterface/NMX/Caller.h"

namespace NMX
{

class FileWork;

/// What goes with the remote call that this thread is carrying out, for whatever works for it further down. In place
/// while the object lives; the binding makes it where it runs a call, and nobody else does. [any]
class CallContext
{
public:
  /// `files` is null where a call cannot wait for a file.
  CallContext(const Caller& caller, FileWork* files) noexcept;
  CallContext(const CallContext&) = delete;
  CallContext& operator=(const CallContext&) = delete;
  ~CallContext();

  /// The context of this thread; null when it carries out no call.
  [[nodiscard]] static const CallContext* Current() noexcept;

  [[nodiscard]] const Caller& MadeBy() const { return m_caller; }
  [[nodiscard]] FileWork* Files() const { return m_files; }

private:
  const Caller m_caller;
  FileWork* const m_files;
  const CallContext* const m_before;
};

}
