#pragma once

#include <span>
#include <string_view>

namespace RunaCorePluginInterface
{

/// A place in mm in the device's own frame.
struct MarkerPlace
{
  double x;
  double y;
  double z;
};

/// A type of device and the nominal places of its markers.
struct DeviceLayout
{
  std::string_view type;
  std::span<const MarkerPlace> markers;
};

/// The device types that the host knows. [any]
class IDeviceLayoutRegistry
{
public:
  IDeviceLayoutRegistry() = default;
  IDeviceLayoutRegistry(const IDeviceLayoutRegistry&) = delete;
  IDeviceLayoutRegistry& operator=(const IDeviceLayoutRegistry&) = delete;
  virtual ~IDeviceLayoutRegistry() = default;

  /// Adds a type, or replaces the one of that name. The layout lives as long as the program.
  virtual void Register(const DeviceLayout& layout) = 0;
};

}
