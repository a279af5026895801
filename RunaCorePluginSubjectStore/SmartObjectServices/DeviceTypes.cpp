#include "RunaCorePluginSubjectStore/SmartObjectServices/DeviceTypes.h"

#include <array>

namespace SmartObjectServices
{

namespace
{

using RunaCorePluginInterface::DeviceLayout;
using RunaCorePluginInterface::MarkerPlace;

const DeviceLayout& Corvex1()
{
  static constexpr std::array markers{MarkerPlace{-1.75, -24.25, 12.6}, MarkerPlace{-24.25, -24.25, 12.6},
                                      MarkerPlace{-17.75, -4.25, 12.6}, MarkerPlace{-19.75, 18.75, 12.6},
                                      MarkerPlace{22.25, -24.75, 12.6}, MarkerPlace{20.25, 24.75, 12.6},
                                      MarkerPlace{3.75, 6.25, 12.6},    MarkerPlace{24.25, -3.75, 12.6}};
  static constexpr DeviceLayout layout{"Corvex1", markers};
  return layout;
}

const DeviceLayout& Quarex10()
{
  static constexpr std::array markers{MarkerPlace{-39.5, -26.0, 12.6}, MarkerPlace{-37.0, -3.0, 12.6},
                                      MarkerPlace{-35.5, 30.5, 12.6},  MarkerPlace{-8.0, 14.5, 12.6},
                                      MarkerPlace{-5.0, -32.0, 12.6},  MarkerPlace{-0.5, 34.0, 12.6},
                                      MarkerPlace{18.0, 17.5, 12.6},   MarkerPlace{24.0, -19.0, 12.6},
                                      MarkerPlace{33.5, -42.0, 12.6},  MarkerPlace{41.5, 36.0, 12.6}};
  static constexpr DeviceLayout layout{"Quarex10", markers};
  return layout;
}

const DeviceLayout& VelaParkHeadsetV1()
{
  static constexpr std::array markers{
      MarkerPlace{41.9591, 17.1471, 39.7586},   MarkerPlace{10.4018, -113.122, -9.87871},
      MarkerPlace{86.5556, 61.6557, -10.3732},  MarkerPlace{8.41333, 99.6813, -53.152},
      MarkerPlace{-66.4807, 69.4312, -26.0546}, MarkerPlace{-95.1092, -36.9887, -39.8086},
      MarkerPlace{-78.0361, 9.16146, 0.596761}, MarkerPlace{-36.1092, 45.3663, 25.4808},
      MarkerPlace{24.3716, 78.4519, 2.68811},   MarkerPlace{104.647, -5.06697, -3.09316},
      MarkerPlace{-12.6219, -49.7454, 38.8135}, MarkerPlace{47.8225, -50.6484, 33.3166},
      MarkerPlace{-69.5442, -90.529, -51.0023}, MarkerPlace{79.0081, -87.6181, -14.0483},
      MarkerPlace{-50.8296, -83.6585, 6.50136}};
  static constexpr DeviceLayout layout{"VelaParkHeadsetV1", markers};
  return layout;
}

}

void RegisterDeviceTypes(RunaCorePluginInterface::IDeviceLayoutRegistry& registry)
{
  registry.Register(Corvex1());
  registry.Register(Quarex10());
  registry.Register(VelaParkHeadsetV1());
}

std::span<const MarkerPlace> MarkersOf(std::string_view type)
{
  for (const DeviceLayout* layout : {&Corvex1(), &Quarex10(), &VelaParkHeadsetV1()})
    if (layout->type == type)
      return layout->markers;
  return {};
}

const std::vector<std::string>& CompatibleDeviceTypes()
{
  // The host knows the others, but no smart object can be made of them.
  static const std::vector<std::string> types{"Corvex1"};
  return types;
}

}
