#include "StandaloneHost/Panel/VObjectPresetProvider.h"

#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/IEntryEditor.h"

#include <string>
#include <string_view>

namespace Panel
{

using NMX::EntryPath;
using NMX::EResult;
using NMX::IResult;
using NMX::TSubjectStoreId;

namespace
{

/// The preset's name, or null when there is no such preset.
const std::string* NameOf(const NMX::IStoreReader& access, const std::string& preset)
{
  const auto path = EntryPath::Known(preset + "/Name");
  const NMX::Value* name = path ? access.FindApplicationEntry(*path) : nullptr;
  return name != nullptr ? std::get_if<std::string>(name) : nullptr;
}

}

IResult VObjectPresetProvider::Apply(NMX::IEntryEditor& access, TSubjectStoreId preset, TSubjectStoreId subject)
{
  const std::string path = "Application/ObjectPresets/" + std::to_string(preset.Value());
  const std::string* found = NameOf(access, path);
  if (found == nullptr)
    return EResult::NotFound;
  const std::string name = *found; // the edits below may move it
  NMX::ESubjectKind kind{};
  if (const IResult known = access.Kind(subject, kind); known.Failed())
    return known;
  if (kind != NMX::ESubjectKind::BasicObjects && kind != NMX::ESubjectKind::SmartObjects)
    return EResult::InvalidType;
  // The preset exists, so its path may be numbered.
  for (const EntryPath& entry : access.ApplicationEntries(EntryPath(path)))
  {
    const std::string_view parameter = entry.Text().substr(path.size() + 1);
    if (!parameter.starts_with("Parameters/"))
      continue;
    const IResult set =
        access.SetValue(subject, EntryPath(parameter), *access.FindApplicationEntry(entry), NMX::ENotify::Yes);
    if (set.Failed() && set != EResult::NotFound)
      return set;
  }
  return access.SetValue(subject, NMX::Paths::PresetName(), name, NMX::ENotify::Yes);
}

}
