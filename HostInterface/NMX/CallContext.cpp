#include "HostInterface/NMX/CallContext.h"

namespace NMX
{

namespace
{

thread_local const CallContext* current = nullptr;

}

CallContext::CallContext(const Caller& caller, FileWork* files) noexcept
    : m_caller(caller), m_files(files), m_before(current)
{
  current = this;
}

CallContext::~CallContext()
{
  current = m_before;
}

const CallContext* CallContext::Current() noexcept
{
  return current;
}

}
