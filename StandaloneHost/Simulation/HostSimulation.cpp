#include "StandaloneHost/Simulation/HostSimulation.h"

#include "StandaloneHost/Simulation/Devices.h"
#include "StandaloneHost/Simulation/VHostFunction.h"

#include <algorithm>
#include <iterator>
#include <span>
#include <type_traits>
#include <utility>

namespace Simulation
{

using NMX::IResult;
using TerminalServer2::ArgumentText;
using TerminalServer2::ArgumentType;
using TerminalServer2::EArgumentType;
using TerminalServer2::EDirection;

namespace
{

constexpr TerminalServer2::Level preview = 1;

constexpr TerminalServer2::TypeRecord group{
    "HostSimulation",
    "Functions of the standalone host for trying out what device states do, without any devices. The host's devices "
    "are what is recorded of them.",
    {}};

constexpr ArgumentType boolIn{EArgumentType::Bool, EDirection::Input};
constexpr ArgumentType numberIn{EArgumentType::UInt32, EDirection::Input};
constexpr ArgumentType textIn{EArgumentType::Text, EDirection::Input};
constexpr ArgumentType boolOut{EArgumentType::Bool, EDirection::Output};
constexpr ArgumentType numberOut{EArgumentType::UInt32, EDirection::Output};
constexpr ArgumentType textOut{EArgumentType::Text, EDirection::Output};
constexpr ArgumentType textsOut{EArgumentType::TextSet, EDirection::Output};

constexpr ArgumentType texts[] = {textsOut};
constexpr ArgumentType urn[] = {textIn};
constexpr ArgumentType urnAndText[] = {textIn, textIn};
constexpr ArgumentType urnAndBool[] = {textIn, boolIn};
constexpr ArgumentType urnAndNumber[] = {textIn, numberIn};
constexpr ArgumentType urnAndState[] = {textIn, textOut, boolOut, boolOut, numberOut, numberOut};

constexpr ArgumentText urnText{"Urn", "URN of the device."};
constexpr ArgumentText devicesTexts[] = {{"Urns", "List of device URNs."}};
constexpr ArgumentText stateTexts[] = {urnText,
                                       {"Type", "Type of the device."},
                                       {"Connected", "If the device is connected."},
                                       {"Charging", "If the device is charging."},
                                       {"Battery", "Charge of the battery in percent."},
                                       {"Radio", "Radio channel of the device, 0 if it has none."}};
constexpr ArgumentText addTexts[] = {{"Urn", "URN of the new device."}, {"Type", "Type of the new device."}};
constexpr ArgumentText removeTexts[] = {urnText};
constexpr ArgumentText connectedTexts[] = {urnText, {"Connected", "If the device should be connected."}};
constexpr ArgumentText chargingTexts[] = {urnText, {"Charging", "If the device should be charging."}};
constexpr ArgumentText batteryTexts[] = {urnText, {"Percent", "New charge of the battery in percent."}};
constexpr ArgumentText radioTexts[] = {urnText, {"Radio", "New radio channel of the device, 0 for none."}};

constexpr std::string_view orNotFound = "Ok - On success.\n"
                                        "NotFound - If there is no device with the URN supplied.";

const std::string& Text(const ArgumentValue& value)
{
  return std::get<std::string>(value);
}

/// The operation for a function that takes a URN and one value more.
template <class T, IResult (Devices::*set)(const std::string&, T)>
IResult SetOf(Devices& devices, const ArgumentValues& inputs, ArgumentValues&)
{
  return (devices.*set)(Text(inputs[0]), std::get<std::remove_cvref_t<T>>(inputs[1]));
}

IResult ListDevices(Devices& devices, const ArgumentValues&, ArgumentValues& outputs)
{
  outputs[0] = devices.Urns();
  return NMX::EResult::Ok;
}

IResult TellState(Devices& devices, const ArgumentValues& inputs, ArgumentValues& outputs)
{
  DeviceState state;
  const IResult found = devices.State(Text(inputs[0]), state);
  outputs = {std::move(state.type), state.connected, state.charging, state.battery, state.radio};
  return found;
}

IResult RemoveDevice(Devices& devices, const ArgumentValues& inputs, ArgumentValues&)
{
  return devices.Remove(Text(inputs[0]));
}

struct Row
{
  TerminalServer2::FunctionRecord record;
  std::span<const ArgumentType> types;
  IResult (*operation)(Devices&, const ArgumentValues&, ArgumentValues&);
};

constexpr Row rows[] = {
    {{"HostSimulation.Devices", "The list of devices.", devicesTexts, "Ok - On success."}, texts, &ListDevices},
    {{"HostSimulation.DeviceState", "Get the state of a device.", stateTexts, orNotFound}, urnAndState, &TellState},
    {{"HostSimulation.AddDevice",
      "Add a device, connected, with a full battery, not charging, and without a radio channel.", addTexts,
      "Ok - On success.\n"
      "AlreadyPresent - If there is a device with the URN supplied.\n"
      "InvalidArgument - If the URN or the type is empty, or if the URN contains a slash or a control character or is "
      "longer than 255 bytes."},
     urnAndText,
     &SetOf<const std::string&, &Devices::Add>},
    {{"HostSimulation.RemoveDevice", "Remove a device. Links to it stay.", removeTexts, orNotFound},
     urn,
     &RemoveDevice},
    {{"HostSimulation.SetConnected", "Connect or disconnect a device.", connectedTexts, orNotFound},
     urnAndBool,
     &SetOf<bool, &Devices::SetConnected>},
    {{"HostSimulation.SetCharging", "Start or end the charging of a device.", chargingTexts, orNotFound},
     urnAndBool,
     &SetOf<bool, &Devices::SetCharging>},
    {{"HostSimulation.SetBattery", "Set the charge of a device's battery.", batteryTexts,
      "Ok - On success.\n"
      "InvalidValue - If the charge supplied is greater than 100.\n"
      "NotFound - If there is no device with the URN supplied."},
     urnAndNumber,
     &SetOf<std::uint32_t, &Devices::SetBattery>},
    {{"HostSimulation.SetRadio", "Set the radio channel of a device.", radioTexts, orNotFound},
     urnAndNumber,
     &SetOf<std::uint32_t, &Devices::SetRadio>},
};

constexpr bool Fits(const Row& row)
{
  return row.record.arguments.size() == row.types.size();
}
static_assert(std::all_of(std::begin(rows), std::end(rows), Fits), "every argument needs its text and its type");

}

void RegisterGroup(TerminalServer2::IServer& server, std::shared_ptr<NMX::IStore> store,
                   const std::shared_ptr<NMX::IPostalService>& strand)
{
  const auto devices = std::make_shared<Devices>(std::move(store));
  (void)server.RegisterType(preview, group);
  for (const Row& row : rows)
    (void)server.RegisterFunction(
        preview, NMX::MakeShared<VHostFunction>(
                     row.record, row.types,
                     [devices, operation = row.operation](const ArgumentValues& inputs, ArgumentValues& outputs)
                     { return operation(*devices, inputs, outputs); }, strand));
}

}
