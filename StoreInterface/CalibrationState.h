#pragma once

#include <cstdint>

/// What the entry "Parameters/Calibration" means. Any other number means the same as `none`.
namespace NMX::CalibrationState
{

inline constexpr std::int32_t none = 0;
inline constexpr std::int32_t running = 1;
inline constexpr std::int32_t done = 2;

}
