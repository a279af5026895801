#include "StandaloneHost/Evaluation/ConfusionWarnings.h"

#include "StandaloneHost/Evaluation/EvaluatedObject.h"
#include "StandaloneHost/Evaluation/EvaluationSettings.h"
#include "StoreInterface/EntryPaths.h"
#include "StoreInterface/TypedAccess.h"

#include <algorithm>
#include <utility>

namespace Evaluation
{

namespace
{

using NMX::EResult;
using NMX::IResult;

enum class EConfusion
{
  None,
  Possible,
  Likely
};

EConfusion Judge(std::optional<double> closest, double threshold)
{
  if (!closest || *closest >= threshold)
    return EConfusion::None;
  return *closest < threshold / 2 ? EConfusion::Likely : EConfusion::Possible;
}

/// Sets an object's two warnings to `wanted`, or leaves them when it need only be `atLeast` that.
IResult Write(NMX::IEntryEditor& editor, NMX::TSubjectStoreId object, EConfusion wanted, bool atLeast, bool& changed)
{
  bool possible = false;
  bool likely = false;
  if (const IResult read = NMX::Read(editor, object, NMX::Paths::WarningObjectConfusion(), possible); read.Failed())
    return read;
  if (const IResult read = NMX::Read(editor, object, NMX::Paths::WarningObjectConfusionCritical(), likely);
      read.Failed())
    return read;
  const EConfusion shown = likely ? EConfusion::Likely : possible ? EConfusion::Possible : EConfusion::None;
  if (atLeast && shown >= wanted)
    return EResult::Ok;
  for (const auto& [path, value, old] :
       {std::tuple(NMX::Paths::WarningObjectConfusion(), wanted == EConfusion::Possible, possible),
        std::tuple(NMX::Paths::WarningObjectConfusionCritical(), wanted == EConfusion::Likely, likely)})
  {
    if (value == old)
      continue;
    if (const IResult written = editor.SetValue(object, path, value); written.Failed())
      return written;
    changed = true;
  }
  return EResult::Ok;
}

}

IResult WriteWarnings(NMX::IStore& store, const std::vector<Comparisons::Finding>& findings, bool& changed)
{
  const auto editor = store.Editor();
  const EvaluationSettings settings = ReadSettings(*editor);
  if (!settings.enabled)
    return EResult::Ok;
  for (const auto& finding : findings)
  {
    const IResult written =
        Write(*editor, finding.object, Judge(finding.closest, settings.warningThreshold), !finding.final, changed);
    if (written.Failed() && written != EResult::InvalidId) // it may have been removed in the meantime
      return written;
  }
  return changed ? editor->Commit() : EResult::Ok;
}

IResult ClearWarnings(NMX::IEntryEditor& editor)
{
  bool changed = false;
  for (const NMX::ESubjectKind kind : objectKinds)
  {
    std::vector<NMX::TSubjectStoreId> ids;
    if (const IResult listed = editor.Subjects(kind, ids); listed.Failed())
      return listed;
    for (const NMX::TSubjectStoreId id : ids)
      if (const IResult written = Write(editor, id, EConfusion::None, false, changed); written.Failed())
        return written;
  }
  return EResult::Ok;
}

}
