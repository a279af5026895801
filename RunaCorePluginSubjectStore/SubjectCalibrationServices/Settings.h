#pragma once

#include "HostInterface/NMX/IResult.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/SettingsPaths.h"

#include <string>
#include <vector>

namespace SubjectCalibrationServices
{

/// A setting that has a value of type `T`; null otherwise. Valid as long as the access is, and until the next edit.
template <class T>
const T* FindSetting(const NMX::IStoreReader& access, NMX::ESetting setting)
{
  const NMX::Value* value = access.FindApplicationEntry(NMX::PathOf(setting));
  return value != nullptr ? std::get_if<T>(value) : nullptr;
}

/// The path of the file that is chosen for a setting; empty when none is.
[[nodiscard]] std::wstring ChosenPath(const NMX::IStoreReader& access, NMX::ESetting setting);

/// The names of the files that a setting can be; none when it has no value. An exception is `FailedWithException`, here
/// and below. [any]
NMX::IResult OptionNames(const NMX::IStore& store, NMX::ESetting setting, std::vector<std::string>& names) noexcept;

/// Sets a setting to the file of that name: one edit. `Failed` when there is none. [any]
NMX::IResult Choose(NMX::IStore& store, NMX::ESetting setting, const std::string& name) noexcept;

/// The name and the path of the file that is chosen. `Failed` when none of the setting's files is. [any]
NMX::IResult Chosen(const NMX::IStore& store, NMX::ESetting setting, std::string& name, std::string& path) noexcept;

}
