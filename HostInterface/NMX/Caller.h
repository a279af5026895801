#pragma once

#include <cstdint>

namespace NMX
{

/// Who makes a call, as far as the server tells callers apart: all calls of one connection have the same caller. The
/// default is nobody in particular.
struct Caller
{
  std::uint64_t id = 0;

  friend constexpr bool operator==(const Caller&, const Caller&) = default;
};

}
