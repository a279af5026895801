#include "StandaloneHost/Store/CreateActions.h"

#include "StandaloneHost/Store/NameRule.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/SettingsPaths.h"

#include <algorithm>
#include <optional>
#include <string>
#include <utility>

namespace Store
{

namespace
{

using NMX::ESetting;

constexpr const char* calibrationRuns = "A subject calibration is running.";
constexpr const char* noCalibrationRuns = "No subject calibration is running.";

/// Something that can be made, once it has a name and, if it is made from a file, that file.
struct Creation
{
  ESetting action;
  ESetting name;
  std::optional<ESetting> file;
  const char* withoutFile;
};

constexpr Creation creations[] = {
    {ESetting::CreateCFCAction, ESetting::CreateCFCName, ESetting::CreateCFCTemplate,
     "No character template is chosen."},
    {ESetting::CreateLabellingClusterAction, ESetting::CreateLabellingClusterName, std::nullopt, nullptr},
    {ESetting::CreateObjectAction, ESetting::CreateObjectName, std::nullopt, nullptr},
    {ESetting::CreateSmartObjectAction, ESetting::CreateSmartObjectName, ESetting::CreateSmartObjectTemplate,
     "No smart object template is chosen."},
    {ESetting::CreateSubjectAction, ESetting::CreateSubjectName, ESetting::CreateSubjectTemplate,
     "No labelling template is chosen."},
};

template <class T>
const T& Setting(const Draft& draft, ESetting setting)
{
  static const T none{};
  const NMX::Value* value = draft.FindApplicationEntry(NMX::PathOf(setting));
  const T* typed = value != nullptr ? std::get_if<T>(value) : nullptr;
  return typed != nullptr ? *typed : none;
}

bool CalibrationRuns(const Draft& draft)
{
  return draft.FindApplicationEntry(CalibrationRunning()) != nullptr;
}

/// Why something cannot be made; empty when it can.
std::string Obstacle(const Draft& draft, const Creation& creation)
{
  if (creation.action == ESetting::CreateSubjectAction && CalibrationRuns(draft))
    return calibrationRuns;
  const auto& name = Setting<std::string>(draft, creation.name);
  if (name.empty())
    return "No name is given.";
  if (name.size() > NameRule::maximumBytes)
    return "The name is too long.";
  if (!NameRule::Allows(name, Setting<std::string>(draft, ESetting::NameRegex)))
    return "The name \"" + name + "\" is not allowed.";
  if (draft.Find(name) != nullptr)
    return "There is a subject named \"" + name + "\" already.";
  if (creation.file && Setting<NMX::Option>(draft, *creation.file).chosen.empty())
    return creation.withoutFile;
  return {};
}

/// `obstacle()` tells why an action is not possible.
template <class Tell>
void Set(Draft& draft, ESetting setting, Tell obstacle)
{
  const NMX::Value* current = draft.FindApplicationEntry(NMX::PathOf(setting));
  if (current == nullptr)
    return;
  std::string reason = obstacle();
  const std::uint32_t state = reason.empty() ? 0 : NMX::Action::impossible;
  NMX::Value wanted = NMX::Action{state, std::move(reason)};
  if (*current != wanted)
    draft.SetApplicationEntry(NMX::PathOf(setting), std::move(wanted));
}

/// Whether an edit changes what the actions depend on.
bool Concerned(const Draft& draft)
{
  const std::string_view settings = NMX::PathOf(ESetting::Root).Text();
  for (const auto& [path, value] : draft.Changes().applicationEntries)
    if (path == CalibrationRunning() || path.Text().starts_with(settings))
      return true;
  return std::any_of(draft.Changes().subjects.begin(), draft.Changes().subjects.end(),
                     [&](const auto& change)
                     {
                       const SubjectRecord* before = draft.Base().Find(change.first);
                       const SubjectRecord* now = change.second.record.get();
                       return before == nullptr || now == nullptr || before->Name() != now->Name();
                     });
}

}

NMX::EntryPath CalibrationRunning()
{
  return NMX::Paths::PathConstant<"Application/SubjectCalibration/Running">();
}

void DeriveCreateActions(Draft& draft)
{
  if (Concerned(draft))
    DeriveAllCreateActions(draft);
}

void DeriveAllCreateActions(Draft& draft)
{
  for (const Creation& creation : creations)
    Set(draft, creation.action, [&] { return Obstacle(draft, creation); });
  Set(draft, ESetting::CalibrationAction, [&] { return CalibrationRuns(draft) ? calibrationRuns : ""; });
  Set(draft, ESetting::CancelCalibrationAction, [&] { return CalibrationRuns(draft) ? "" : noCalibrationRuns; });
}

}
