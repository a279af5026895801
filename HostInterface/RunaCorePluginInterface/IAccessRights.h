#pragma once

#include <cstdint>

namespace RunaCorePluginInterface
{

/// What a host may be asked to open.
namespace AccessRight
{
inline constexpr std::uint32_t subjectCalibration = 3; ///< subject calibration to every remote client
}

/// Tells what the host opens. [host]
class IAccessRights
{
public:
  virtual ~IAccessRights() = default;

  [[nodiscard]] virtual bool Granted(std::uint32_t right) const = 0;
};

}
