#include "SubjectStoreUI/VStoreObjectPresetModel.h"

#include "HostInterface/NMX/GlobalLog.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/ValueLimits.h"
#include "SubjectStoreUI/SubjectsModelRole.h"

#include <QPointer>
#include <QThread>

#include <algorithm>
#include <charconv>
#include <limits>
#include <map>
#include <optional>
#include <utility>

namespace SubjectStoreUI
{

namespace Paths = NMX::Paths;
namespace Role = ObjectPresetRole;
using NMX::EntryPath;
using NMX::TSubjectStoreId;

namespace
{

using Number = TSubjectStoreId::RepresentationType;

constexpr std::string_view nameKey = "Name";
constexpr std::string_view readOnlyKey = "ReadOnly";

EntryPath Presets()
{
  return Paths::PathConstant<"Application/ObjectPresets">();
}

struct PresetEntry
{
  TSubjectStoreId preset;
  std::string_view key;
};

/// What an entry beneath the presets belongs to. Each number has one text: without a sign or leading zeros.
std::optional<PresetEntry> Parse(EntryPath path)
{
  const std::string_view text = path.Text().substr(Presets().Text().size() + 1);
  if (text.starts_with('0'))
    return std::nullopt;
  const char* const end = text.data() + text.size();
  Number number = 0;
  const auto [rest, error] = std::from_chars(text.data(), end, number);
  if (error != std::errc{} || rest == end || *rest != '/')
    return std::nullopt;
  return PresetEntry{TSubjectStoreId(number), std::string_view(rest + 1, end)};
}

/// What the store has under a number. It is a preset if it has a name.
struct StoredPreset
{
  std::vector<EntryPath> entries;
  std::optional<std::string> name;
  bool readOnly = false;
};

std::map<TSubjectStoreId, StoredPreset> ReadStored(const NMX::IStoreReader& access)
{
  std::map<TSubjectStoreId, StoredPreset> stored;
  for (const EntryPath& path : access.ApplicationEntries(Presets()))
  {
    const auto entry = Parse(path);
    const NMX::Value* value = access.FindApplicationEntry(path);
    if (!entry || value == nullptr)
      continue;
    StoredPreset& preset = stored[entry->preset];
    preset.entries.push_back(path);
    if (const auto* name = std::get_if<std::string>(value); name != nullptr && entry->key == nameKey)
      preset.name = *name;
    if (const bool* readOnly = std::get_if<bool>(value); readOnly != nullptr && entry->key == readOnlyKey)
      preset.readOnly = *readOnly;
  }
  return stored;
}

bool IsObject(const NMX::IStoreReader& access, TSubjectStoreId subject)
{
  NMX::ESubjectKind kind{};
  return access.Kind(subject, kind).Succeeded() &&
         (kind == NMX::ESubjectKind::BasicObjects || kind == NMX::ESubjectKind::SmartObjects);
}

/// The parameters of an object that presets keep, as far as it has them; none of anything else.
std::vector<std::pair<EntryPath, NMX::Value>> Parameters(const NMX::IStoreReader& access, TSubjectStoreId object)
{
  std::vector<std::pair<EntryPath, NMX::Value>> parameters;
  if (!IsObject(access, object))
    return parameters;
  for (const EntryPath& path : {Paths::ColourRGBA(), Paths::ProximityGroupName(), Paths::TemplateGroupName()})
  {
    const NMX::Value* value = nullptr;
    if (access.Find(object, path, value).Succeeded() && value != nullptr)
      parameters.emplace_back(path, *value);
  }
  return parameters;
}

}

const QHash<int, QByteArray>& ObjectPresetRole::Names()
{
  static const QHash<int, QByteArray> names = RoleNames(keys);
  return names;
}

VStoreObjectPresetModel::VStoreObjectPresetModel(std::shared_ptr<NMX::IStore> store,
                                                 std::weak_ptr<NMX::IPostalService> gui,
                                                 std::function<TSubjectStoreId()> firstSelectedObject)
    : m_store(std::move(store)), m_firstSelectedObject(std::move(firstSelectedObject))
{
  // Before the first look, so that no change falls in between.
  m_changes = m_store->OnChange(std::string(Presets().Text()) + "/*", std::move(gui),
                                [self = QPointer<VStoreObjectPresetModel>(this)]
                                {
                                  if (self)
                                    self->Refresh();
                                });
  m_presets = Read();
}

int VStoreObjectPresetModel::rowCount(const QModelIndex& parent) const
{
  return parent.isValid() ? 0 : static_cast<int>(m_presets.size());
}

QVariant VStoreObjectPresetModel::data(const QModelIndex& index, int role) const
{
  if (!index.isValid() || index.model() != this || index.row() >= rowCount())
    return {};
  const Preset& preset = m_presets[static_cast<std::size_t>(index.row())];
  switch (role)
  {
  case Role::StoreId:
    return QVariant::fromValue(VStoreIdGadget(preset.id));
  case Role::Name:
    return QString::fromStdString(preset.name);
  case Role::ReadOnly:
    return preset.readOnly;
  default:
    return {};
  }
}

QHash<int, QByteArray> VStoreObjectPresetModel::roleNames() const
{
  return Role::Names();
}

bool VStoreObjectPresetModel::addPreset(const QString& name)
{
  Q_ASSERT(thread() == QThread::currentThread());
  if (!presetNameIsValid(name))
    return false;
  // Before the edit, which others wait for.
  const TSubjectStoreId object = m_firstSelectedObject ? m_firstSelectedObject() : TSubjectStoreId{};
  const std::string text = name.toStdString();
  const auto editor = m_store->Editor();
  // The rows may not have heard of the latest presets yet.
  const auto stored = ReadStored(*editor);
  if (std::any_of(stored.begin(), stored.end(), [&](const auto& known) { return known.second.name == text; }))
    return false;
  // Above all numbers, those without a name too: the new preset must not inherit their entries.
  const Number highest = stored.empty() ? 0 : stored.rbegin()->first.Value();
  if (highest == std::numeric_limits<Number>::max())
    return false;
  const std::string path = std::string(Presets().Text()) + '/' + std::to_string(highest + 1) + '/';
  const auto write = [&](std::string_view key, NMX::Value value)
  { return editor->SetApplicationEntry(EntryPath(path + std::string(key)), std::move(value)).Succeeded(); };
  if (!write(nameKey, text) || !write(readOnlyKey, false))
    return false;
  for (auto& [parameter, value] : Parameters(*editor, object))
    if (!write(parameter.Text(), std::move(value)))
      return false;
  return editor->Commit().Succeeded();
}

bool VStoreObjectPresetModel::removePreset(const VStoreIdGadget& preset)
{
  Q_ASSERT(thread() == QThread::currentThread());
  const auto editor = m_store->Editor();
  const auto stored = ReadStored(*editor);
  const auto found = stored.find(preset.Id());
  if (found == stored.end() || !found->second.name)
    return false;
  if (found->second.readOnly)
  {
    NMX::Log(NMX::subjectStoreLog, NMX::ESeverity::Warning, "Object preset '%1%' is read-only, it is not removed.",
             *found->second.name);
    return false;
  }
  for (const EntryPath& path : found->second.entries)
    if (editor->SetApplicationEntry(path, {}).Failed())
      return false;
  return editor->Commit().Succeeded();
}

bool VStoreObjectPresetModel::presetNameIsValid(const QString& name) const
{
  const std::string text = name.toStdString();
  return !text.empty() && NMX::ValueLimits::TextProblem(text).empty() &&
         std::none_of(m_presets.begin(), m_presets.end(), [&](const Preset& preset) { return preset.name == text; });
}

std::vector<VStoreObjectPresetModel::Preset> VStoreObjectPresetModel::Read() const
{
  std::vector<Preset> presets;
  for (auto& [id, stored] : ReadStored(*m_store->Reader()))
    if (stored.name)
      presets.push_back({id, std::move(*stored.name), stored.readOnly});
  return presets;
}

void VStoreObjectPresetModel::Refresh()
{
  Q_ASSERT(thread() == QThread::currentThread());
  // No access is open any more when the first signal is sent: whoever hears it may edit.
  auto presets = Read();
  beginResetModel();
  m_presets = std::move(presets);
  endResetModel();
}

}
