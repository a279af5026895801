#include "StandaloneHost/Simulation/Devices.h"

#include "StoreInterface/EntryPaths.h"

#include <algorithm>
#include <utility>

namespace Simulation
{

using NMX::EResult;
using NMX::IResult;

namespace
{

constexpr std::string_view devices = "Application/Devices/";
constexpr std::string_view rebooting = "Rebooting"; // there while it is
constexpr std::size_t maximumUrnBytes = 255;
constexpr std::uint32_t fullBattery = 100;

std::string PathText(const std::string& urn, std::string_view entry)
{
  return std::string(devices) + urn + '/' + std::string(entry);
}

/// An entry of a device, or null. The URN may be any text: what is not a path yet is not made one.
const NMX::Value* Find(const NMX::IStoreReader& reader, const std::string& urn, std::string_view entry)
{
  const auto path = NMX::EntryPath::Known(PathText(urn, entry));
  return path ? reader.FindApplicationEntry(*path) : nullptr;
}

bool Exists(const NMX::IStoreReader& reader, const std::string& urn)
{
  return Find(reader, urn, "Type") != nullptr;
}

template <class T>
void Take(const NMX::Value* value, T& target)
{
  if (const T* typed = value != nullptr ? std::get_if<T>(value) : nullptr)
    target = *typed;
}

bool IsUrn(std::string_view urn)
{
  const auto forbidden = [](unsigned char c) { return c < 0x20 || c == 0x7F || c == '/'; };
  return !urn.empty() && urn.size() <= maximumUrnBytes && std::none_of(urn.begin(), urn.end(), forbidden);
}

}

Devices::Devices(std::shared_ptr<NMX::IStore> store) : m_store(std::move(store)) {}

std::set<std::string> Devices::Urns() const
{
  return UrnsWith("Type");
}

std::set<std::string> Devices::Rebooting() const
{
  return UrnsWith(rebooting);
}

std::set<std::string> Devices::UrnsWith(std::string_view entry) const
{
  std::set<std::string> urns;
  const std::string end = '/' + std::string(entry);
  const auto reader = m_store->Reader();
  for (const NMX::EntryPath& path : reader->ApplicationEntries(NMX::Paths::PathConstant<"Application/Devices">()))
  {
    std::string_view text = path.Text();
    text.remove_prefix(std::min(devices.size(), text.size()));
    if (text.ends_with(end))
      urns.emplace(text.substr(0, text.size() - end.size()));
  }
  return urns;
}

IResult Devices::State(const std::string& urn, DeviceState& state) const
{
  const auto reader = m_store->Reader();
  if (!Exists(*reader, urn))
    return EResult::NotFound;
  Take(Find(*reader, urn, "Type"), state.type);
  Take(Find(*reader, urn, "Connected"), state.connected);
  Take(Find(*reader, urn, "Charging"), state.charging);
  Take(Find(*reader, urn, "Battery"), state.battery);
  Take(Find(*reader, urn, "Radio"), state.radio);
  return EResult::Ok;
}

IResult Devices::Add(const std::string& urn, const std::string& type)
{
  if (!IsUrn(urn) || type.empty())
    return EResult::InvalidArgument;
  const auto editor = m_store->Editor();
  if (Exists(*editor, urn))
    return EResult::AlreadyPresent;
  const std::pair<std::string_view, NMX::Value> entries[] = {
      {"Type", type}, {"Connected", true}, {"Charging", false}, {"Battery", fullBattery}, {"Radio", std::uint32_t{0}}};
  for (const auto& [entry, value] : entries)
    if (const IResult set = editor->SetApplicationEntry(NMX::EntryPath(PathText(urn, entry)), value); set.Failed())
      return set;
  return editor->Commit();
}

IResult Devices::Remove(const std::string& urn)
{
  const auto editor = m_store->Editor();
  if (!Exists(*editor, urn))
    return EResult::NotFound;
  // The device exists, so its path may be numbered.
  for (const NMX::EntryPath& path : editor->ApplicationEntries(NMX::EntryPath(std::string(devices) + urn)))
    if (const IResult removed = editor->SetApplicationEntry(path, {}); removed.Failed())
      return removed;
  return editor->Commit();
}

IResult Devices::SetConnected(const std::string& urn, bool connected)
{
  return Set(urn, "Connected", connected);
}

IResult Devices::SetCharging(const std::string& urn, bool charging)
{
  return Set(urn, "Charging", charging);
}

IResult Devices::SetBattery(const std::string& urn, std::uint32_t percent)
{
  return percent > fullBattery ? IResult(EResult::InvalidValue) : Set(urn, "Battery", percent);
}

IResult Devices::SetRadio(const std::string& urn, std::uint32_t radio)
{
  return Set(urn, "Radio", radio);
}

IResult Devices::BeginReboot(const std::string& urn)
{
  const auto editor = m_store->Editor();
  if (!Exists(*editor, urn))
    return EResult::NotFound;
  bool connected = false;
  Take(Find(*editor, urn, "Connected"), connected);
  if (!connected)
    return EResult::NotConnected;
  const std::pair<std::string_view, bool> entries[] = {{"Connected", false}, {rebooting, true}};
  for (const auto& [entry, value] : entries)
    if (const IResult set = editor->SetApplicationEntry(NMX::EntryPath(PathText(urn, entry)), value); set.Failed())
      return set;
  return editor->Commit();
}

IResult Devices::EndReboot(const std::string& urn)
{
  const auto editor = m_store->Editor();
  if (!Exists(*editor, urn))
    return EResult::NotFound;
  if (Find(*editor, urn, rebooting) == nullptr)
    return EResult::OkButNoEffect;
  if (const IResult set = editor->SetApplicationEntry(NMX::EntryPath(PathText(urn, rebooting)), {}); set.Failed())
    return set;
  if (const IResult set = editor->SetApplicationEntry(NMX::EntryPath(PathText(urn, "Connected")), true); set.Failed())
    return set;
  return editor->Commit();
}

IResult Devices::Set(const std::string& urn, std::string_view entry, NMX::Value value)
{
  const auto editor = m_store->Editor();
  if (!Exists(*editor, urn))
    return EResult::NotFound;
  // The device exists, so its paths may be numbered.
  const NMX::EntryPath path(PathText(urn, entry));
  if (const IResult set = editor->SetApplicationEntry(path, std::move(value)); set.Failed())
    return set;
  return editor->Commit();
}

}
