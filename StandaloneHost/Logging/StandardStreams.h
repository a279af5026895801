#pragma once

#include <chrono>
#include <string>
#include <string_view>

namespace Logging
{

/// Opens /dev/null in the place of standard descriptors that are closed: a file or a connection would get the number
/// otherwise, and what is written to standard error. [host]
void OpenStandardDescriptors();

/// Writes all of it, however long that takes. False when the system refuses; `begun` then tells whether part of it was
/// written. [any]
[[nodiscard]] bool WriteAll(int descriptor, std::string_view text, bool& begun);

/// Writes all of it in a thread of its own and waits so long for that; false when it is not written by then. A paused
/// terminal takes nothing, and there is no other way not to wait for it: its descriptor is shared with other programs,
/// which must not find it changed. [any]
[[nodiscard]] bool WriteWithin(int descriptor, std::string text, std::chrono::milliseconds time);

/// How long the start and the end of the host wait for somebody to read.
inline constexpr auto patience = std::chrono::milliseconds(1000);

}
